#include "tools/qxtool/command_line.h"

#include <CLI/App.hpp>
#include <CLI/Config.hpp>
#include <CLI/Formatter.hpp>

#include <algorithm>
#include <functional>
#include <sstream>

#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/qxtool/commands.h"

namespace {

constexpr const char* kVersion = "qxtool " QXTOOL_VERSION;

class CommandLine {
 public:
  CommandLine();
  int Run(std::vector<std::string> arguments);

 private:
  using Action = std::function<int()>;

  CLI::App* Add(CLI::App* parent, const char* name, const char* description);
  // A command that does something itself, with what does it.
  CLI::App* Add(CLI::App* parent, const char* name, const char* description, Action action);
  CLI::App* AddGroup(const char* name, const char* description);
  // Adds what belongs to a command only when it is the one that was asked for: a start pays for no other.
  static void WhenChosen(CLI::App* command, const std::function<void(CLI::App*)>& fill);
  static void AddUnicodePolicy(CLI::App* command, bool& isFull);
  void AddDetect();
  void AddTextPipe(const char* name, const char* description, int (*run)(const TextPipeOptions&));
  void AddEncodings();
  void AddZip();
  void AddSettings();
  void AddIni();
  void AddFind();
  void AddSort();
  void AddInfo();
  std::string ReasonOf(const CLI::ParseError& error) const;

  CLI::App m_app;
  std::vector<std::pair<CLI::App*, Action>> m_actions;
  DetectOptions m_detect;
  TextPipeOptions m_textPipe;  // one for all: only one command is run
  EncodingsOptions m_encodings;
  ZipOptions m_zip;
  SettingsOptions m_settings;
  IniOptions m_ini;
  FindOptions m_find;
  SortOptions m_sort;
  InfoOptions m_info;
};

CommandLine::CommandLine()
    : m_app("Converts text files, reads zip archives, finds, sorts and describes files, and keeps settings.",
            "qxtool") {
  // A path may begin with a slash.
  m_app.allow_windows_style_options(false);
  m_app.set_version_flag("--version", kVersion);
  m_app.require_subcommand(1);
  AddDetect();
  AddTextPipe("convert", "Convert a text file to another encoding", Convert);
  AddTextPipe("escape", "Turn a text file into 7-bit text with Unicode escapes", Escape);
  AddTextPipe("unescape", "Turn Unicode escapes back into text", Unescape);
  AddEncodings();
  AddZip();
  AddSettings();
  AddIni();
  AddFind();
  AddSort();
  AddInfo();
}

CLI::App* CommandLine::Add(CLI::App* parent, const char* name, const char* description) {
  CLI::App* command = parent->add_subcommand(name, description);
  command->set_version_flag("--version", kVersion);
  return command;
}

CLI::App* CommandLine::Add(CLI::App* parent, const char* name, const char* description, Action action) {
  CLI::App* command = Add(parent, name, description);
  m_actions.emplace_back(command, std::move(action));
  return command;
}

CLI::App* CommandLine::AddGroup(const char* name, const char* description) {
  CLI::App* group = Add(&m_app, name, description);
  group->require_subcommand(1);
  return group;
}

void CommandLine::WhenChosen(CLI::App* command, const std::function<void(CLI::App*)>& fill) {
  command->preparse_callback([command, fill](std::size_t) { fill(command); });
}

void CommandLine::AddUnicodePolicy(CLI::App* command, bool& isFull) {
  command->add_flag("!--no-full-unicode", isFull,
                    "Take UTF-8 of up to three bytes only and UTF-16 without a mark as the library does by itself");
}

void CommandLine::AddDetect() {
  CLI::App* command = Add(&m_app, "detect", "Find out how text files are encoded", [this] { return Detect(m_detect); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen->add_option("--hint", m_detect.hint, "The encoding that is expected")
        ->type_name("NAME")
        ->capture_default_str();
    chosen
        ->add_option("--level", m_detect.level, "How much of a file decides: none, quick (4 KB), fair (16 KB) or full")
        ->check(CLI::IsMember({"none", "quick", "fair", "full"}))
        ->type_name("LEVEL")
        ->default_str("full");
    chosen
        ->add_option("--favor", m_detect.favor,
                     "What wins when both are possible: hint, guess, or none for the hint with a warning")
        ->check(CLI::IsMember({"hint", "guess", "none"}))
        ->type_name("WHICH")
        ->default_str("guess");
    AddUnicodePolicy(chosen, m_detect.fullUnicode);
    chosen->add_flag("--json", m_detect.json, "Print one JSON object instead of lines");
    chosen->add_option("FILE", m_detect.files, "Files; - is standard input")->required();
  });
}

void CommandLine::AddTextPipe(const char* name, const char* description, int (*run)(const TextPipeOptions&)) {
  CLI::App* command = Add(&m_app, name, description, [this, run] { return run(m_textPipe); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen
        ->add_option("--from", m_textPipe.from,
                     "The encoding of IN, with +Detect as a hint only; without it, it is detected")
        ->type_name("NAME")
        ->default_str("ANSI+FullDetect+FavorGuess");
    chosen->add_option("--to", m_textPipe.to, "The encoding of OUT")->type_name("NAME")->capture_default_str();
    chosen->add_option("--replacement", m_textPipe.replacement, "The character for what cannot be converted, or drop")
        ->type_name("C|drop")
        ->default_str("U+FFFD in Unicode, ? elsewhere");
    chosen->add_flag("--lossless", m_textPipe.lossless, "Fail instead of losing characters");
    chosen->add_flag("--if-changed", m_textPipe.ifChanged, "Leave OUT alone when it has the same content already");
    chosen
        ->add_option("--output-dir", m_textPipe.outputDir,
                     "Write any number of files below this folder, under their own names")
        ->type_name("DIR");
    chosen->add_flag(
        "--in-place", m_textPipe.inPlace,
        "Replace any number of files; one that would lose characters is left alone, unless --replacement is "
        "given");
    chosen->add_flag("--recursive", m_textPipe.recursive, "Take the files of folders, too");
    chosen->add_flag("--quiet", m_textPipe.quiet, "Say nothing about losses; the exit status is 3 all the same");
    chosen->add_flag("--verbose", m_textPipe.verbose, "Name each file and the encoding that it was read in");
    AddUnicodePolicy(chosen, m_textPipe.fullUnicode);
    chosen->add_option("IN OUT", m_textPipe.files, "The file to read and the one to write; - is a standard stream")
        ->required();
  });
}

void CommandLine::AddEncodings() {
  CLI::App* command =
      Add(&m_app, "encodings", "List the encodings and their names", [this] { return ListEncodings(m_encodings); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen->add_flag("--installed", m_encodings.installed, "Only those that this machine can convert");
    chosen->add_flag("--json", m_encodings.json, "Print one JSON object instead of lines");
  });
}

void CommandLine::AddZip() {
  CLI::App* zip = AddGroup("zip", "List, test and extract zip archives");
  WhenChosen(zip, [this](CLI::App* group) {
    const auto add = [&](const char* name, const char* description, int (*run)(const ZipOptions&)) {
      CLI::App* command = Add(group, name, description, [this, run] { return run(m_zip); });
      command->add_option("ARCHIVE", m_zip.archive, "The zip archive")->required();
      return command;
    };
    add("list", "List the entries as the central directory has them", ListZip)
        ->add_flag("--json", m_zip.json, "Print one JSON object instead of lines");
    add("test", "Read all entries in sequence and compare them with the central directory", TestZip);
    CLI::App* extract = add("extract", "Write the data of one entry to a file", ExtractZipEntry);
    extract->add_option("ENTRY", m_zip.entry, "The entry's name, as list shows it")->required();
    extract->add_option("OUT", m_zip.out, "The file to write; - is standard output")->required();
    CLI::App* all = add("extract-all", "Write all entries below a folder, and nothing elsewhere", ExtractZip);
    all->add_option("DIR", m_zip.out, "The folder; it is made when it is missing")->required();
    all->add_option("--max-bytes", m_zip.maxBytes, "Fail rather than write more than N bytes")->type_name("N");
    all->add_flag("--force", m_zip.force, "Replace files that exist");
  });
}

void CommandLine::AddSettings() {
  CLI::App* settings = AddGroup("settings", "Read and change settings in the registry");
  WhenChosen(settings, [this](CLI::App* group) {
    const auto add = [&](const char* command, const char* description, int (*run)(const SettingsOptions&)) {
      CLI::App* added = Add(group, command, description, [this, run] { return run(m_settings); });
      added->add_option("PATH", m_settings.path, "The key below the library's own, its parts separated by backslashes")
          ->required();
      return added;
    };
    const auto name = [&](CLI::App* command, const char* description) {
      return command->add_option("NAME", m_settings.name, description)->each([&](const std::string&) {
        m_settings.hasName = true;
      });
    };
    CLI::App* get = add("get", "Print a value; references to variables are replaced", GetSetting);
    name(get, "The value; without it, the key's unnamed one");
    get->add_flag("--json", m_settings.json, "Print one JSON object instead of a line");
    CLI::App* set = add("set", "Write a value; the key is made when it is missing", SetSetting);
    name(set, "The value; an empty one is the key's unnamed one")->required();
    set->add_option("VALUE", m_settings.value, "What it becomes: a text, a number, or bytes as hexadecimal digits")
        ->required();
    set->add_option("--type", m_settings.type, "The kind of value: text, number, binary or expand")
        ->check(CLI::IsMember({"text", "number", "binary", "expand"}))
        ->type_name("TYPE")
        ->capture_default_str();
    CLI::App* list = add("list", "List the keys and values of a key", ListSettings);
    list->add_flag("--recursive", m_settings.recursive, "And of the keys below it");
    list->add_flag("--json", m_settings.json, "Print one JSON object instead of lines");
    CLI::App* remove = add("delete", "Delete a value or a key", DeleteSetting);
    name(remove, "A value of the key, or else a key below it; without it, the key itself");
    remove->add_flag("--recursive", m_settings.recursive, "A key with everything below it");
  });
}

void CommandLine::AddIni() {
  CLI::App* ini = AddGroup("ini", "Read and change initialisation files");
  WhenChosen(ini, [this](CLI::App* group) {
    const auto add = [&](const char* name, const char* description, int (*run)(const IniOptions&)) {
      CLI::App* command = Add(group, name, description, [this, run] { return run(m_ini); });
      command->add_option("FILE", m_ini.file, "The initialisation file")->required();
      return command;
    };
    CLI::App* get = add("get", "Print the value of a key", GetIni);
    get->add_option("SECTION", m_ini.section, "The section")->required();
    get->add_option("KEY", m_ini.key, "The key")->required();
    get->add_flag("--json", m_ini.json, "Print one JSON object instead of a line");
    CLI::App* set = add("set", "Write a key; file and section are made when they are missing", SetIni);
    set->add_option("SECTION", m_ini.section, "The section")->required();
    set->add_option("KEY", m_ini.key, "The key")->required();
    set->add_option("VALUE", m_ini.value, "What its value becomes")->required();
    CLI::App* list = add("list", "List the keys of a section with their values", ListIni);
    list->add_option("SECTION", m_ini.section, "The section; without it, the sections are listed");
    list->add_flag("--json", m_ini.json, "Print one JSON object instead of lines");
  });
}

void CommandLine::AddFind() {
  CLI::App* command = Add(&m_app, "find", "List the files, or the folders, of a tree", [this] { return Find(m_find); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen->add_flag("--folders", m_find.folders, "List folders instead of files");
    chosen->add_flag("--sorted", m_find.sorted, "List in order of the paths");
    chosen->add_option("--match", m_find.match, "Only entries with one of these attributes: letters, or a number")
        ->type_name("ATTRS");
    chosen->add_option("--reject", m_find.reject, "Only entries with none of these attributes")->type_name("ATTRS");
    chosen->add_flag("--native", m_find.native, "Print paths of the system, byte for byte");
    chosen->add_flag("-0,--null", m_find.nulls, "End each path with NUL instead of a line end");
    chosen->add_flag("--json", m_find.json, "Print one JSON object instead of lines");
    chosen->add_option("DIR", m_find.folder, "The folder to look in")->required();
    chosen->add_option("MASK", m_find.mask, "Only names that fit, * and ? standing for any characters")
        ->capture_default_str();
  });
}

void CommandLine::AddSort() {
  CLI::App* command = Add(&m_app, "sort", "Sort the lines of a text file", [this] { return Sort(m_sort); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen->add_option("--by", m_sort.by, "The order: text, number (natural order) or length")
        ->check(CLI::IsMember({"text", "number", "length"}))
        ->type_name("ORDER")
        ->capture_default_str();
    chosen->add_flag("--ignore-case", m_sort.ignoreCase, "Take capital and small letters as the same");
    chosen->add_flag("--reverse", m_sort.reverse, "The last line first");
    chosen
        ->add_option("--from", m_sort.from,
                     "The encoding of FILE, with +Detect as a hint only; without it, it is detected")
        ->type_name("NAME")
        ->default_str("ANSI+FullDetect+FavorGuess");
    AddUnicodePolicy(chosen, m_sort.fullUnicode);
    chosen->add_option("FILE", m_sort.file, "The file to read; - is standard input")->required();
  });
}

void CommandLine::AddInfo() {
  CLI::App* command =
      Add(&m_app, "info", "Tell size, times, attributes and names of files", [this] { return Info(m_info); });
  WhenChosen(command, [this](CLI::App* chosen) {
    chosen->add_flag("--json", m_info.json, "Print one JSON object instead of lines");
    chosen->add_option("FILE", m_info.files, "Files or folders")->required();
  });
}

// What was wrong with the arguments, in one line.
std::string CommandLine::ReasonOf(const CLI::ParseError& error) const {
  const CLI::App* innermost = &m_app;
  while (!innermost->get_subcommands().empty()) innermost = innermost->get_subcommands().front();
  const bool wantsCommand = !innermost->get_subcommands([](const CLI::App*) { return true; }).empty();
  const std::vector<std::string> strangers = wantsCommand ? m_app.remaining(true) : std::vector<std::string>();
  if (strangers.empty()) return error.what();
  const std::string place = innermost == &m_app ? "" : " " + innermost->get_name();
  return "\"" + strangers.front() + "\" is no command; qxtool" + place + " --help lists them";
}

int CommandLine::Run(std::vector<std::string> arguments) {
  std::reverse(arguments.begin(), arguments.end());  // as the parser wants them
  try {
    m_app.parse(std::move(arguments));
  } catch (const CLI::ParseError& e) {
    if (e.get_exit_code() != 0) throw Failure{ReasonOf(e), kWrongUsage};
    std::ostringstream help, none;
    m_app.exit(e, help, none);
    Print(help.str());
    return kDone;
  }
  const auto isAsked = [](const auto& one) { return one.first->parsed(); };
  return std::find_if(m_actions.begin(), m_actions.end(), isAsked)->second();
}

}  // namespace

int RunCommandLine(std::vector<std::string> arguments) { return CommandLine().Run(std::move(arguments)); }
