// qxtool: the library's services for files on the command line.

#include <CLI/App.hpp>
#include <CLI/Config.hpp>
#include <CLI/Formatter.hpp>

#include <algorithm>
#include <cstdio>
#include <exception>
#include <sstream>

#include "qxcore/core/io_exceptions.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/console.h"
#include "tools/qxtool/failure.h"
#include "tools/qxtool/standard_streams.h"

namespace {

constexpr const char* kVersion = "qxtool " QXTOOL_VERSION;

void AddDetect(CLI::App& app, DetectOptions& options) {
  CLI::App* command = app.add_subcommand("detect", "Find out how text files are encoded");
  command->add_option("--hint", options.hint, "The encoding that is expected")
      ->type_name("NAME")
      ->capture_default_str();
  command->add_option("--level", options.level, "How much of a file decides: none, quick (4 KB), fair (16 KB) or full")
      ->check(CLI::IsMember({"none", "quick", "fair", "full"}))
      ->type_name("LEVEL");
  command
      ->add_option("--favor", options.favor,
                   "What wins when both are possible: hint, guess, or none for the hint with a warning")
      ->check(CLI::IsMember({"hint", "guess", "none"}))
      ->type_name("WHICH");
  command->add_flag("--json", options.json, "Print one JSON object instead of lines");
  command->add_option("FILE", options.files, "Files; - is standard input")->required();
}

void AddTextPipe(CLI::App& app, TextPipeOptions& options, const char* name, const char* description) {
  CLI::App* command = app.add_subcommand(name, description);
  command
      ->add_option("--from", options.from,
                   "The encoding of IN, with +Detect as a hint only; without it, it is detected")
      ->type_name("NAME");
  command->add_option("--to", options.to, "The encoding of OUT")->type_name("NAME")->capture_default_str();
  command->add_option("--replacement", options.replacement, "The character for what cannot be converted, or drop")
      ->type_name("C|drop");
  command->add_flag("--lossless", options.lossless, "Fail instead of losing characters");
  command->add_flag("--if-changed", options.ifChanged, "Leave OUT alone when it has the same content already");
  command->add_option("IN", options.in, "The file to read; - is standard input")->required();
  command->add_option("OUT", options.out, "The file to write; - is standard output")->required();
}

void AddEncodings(CLI::App& app, EncodingsOptions& options) {
  CLI::App* command = app.add_subcommand("encodings", "List the encodings and their names");
  command->add_flag("--installed", options.installed, "Only those that this machine can convert");
  command->add_flag("--json", options.json, "Print one JSON object instead of lines");
}

CLI::App* AddZipCommand(CLI::App* zip, ZipOptions& options, const char* name, const char* description) {
  CLI::App* command = zip->add_subcommand(name, description);
  command->set_version_flag("--version", kVersion);
  command->add_option("ARCHIVE", options.archive, "The zip archive")->required();
  return command;
}

void AddZip(CLI::App& app, ZipOptions& options) {
  CLI::App* zip = app.add_subcommand("zip", "List, test and extract zip archives");
  zip->require_subcommand(1);
  AddZipCommand(zip, options, "list", "List the entries as the central directory has them")
      ->add_flag("--json", options.json, "Print one JSON object instead of lines");
  AddZipCommand(zip, options, "test", "Read all entries in sequence and compare them with the central directory");
  CLI::App* extract = AddZipCommand(zip, options, "extract", "Write the data of one entry to a file");
  extract->add_option("ENTRY", options.entry, "The entry's name, as list shows it")->required();
  extract->add_option("OUT", options.out, "The file to write; - is standard output")->required();
  CLI::App* all = AddZipCommand(zip, options, "extract-all", "Write all entries below a folder, and nothing elsewhere");
  all->add_option("DIR", options.out, "The folder; it is made when it is missing")->required();
  all->add_option("--max-bytes", options.maxBytes, "Fail rather than write more than N bytes")->type_name("N");
  all->add_flag("--force", options.force, "Replace files that exist");
}

int RunZip(const CLI::App& zip, const ZipOptions& options) {
  if (zip.got_subcommand("list")) return ListZip(options);
  if (zip.got_subcommand("test")) return TestZip(options);
  if (zip.got_subcommand("extract")) return ExtractZipEntry(options);
  return ExtractZip(options);
}

CLI::App* AddSettingsCommand(CLI::App* settings, SettingsOptions& options, const char* name, const char* description) {
  CLI::App* command = settings->add_subcommand(name, description);
  command->set_version_flag("--version", kVersion);
  command->add_option("PATH", options.path, "The key below the library's own, its parts separated by backslashes")
      ->required();
  return command;
}

void AddSettings(CLI::App& app, SettingsOptions& options) {
  CLI::App* settings = app.add_subcommand("settings", "Read and change settings in the registry");
  settings->require_subcommand(1);
  const auto name = [&](CLI::App* command, const char* description) {
    return command->add_option("NAME", options.name, description)->each([&](const std::string&) {
      options.hasName = true;
    });
  };
  CLI::App* get = AddSettingsCommand(settings, options, "get", "Print a value; references to variables are replaced");
  name(get, "The value; without it, the key's unnamed one");
  get->add_flag("--json", options.json, "Print one JSON object instead of a line");
  CLI::App* set = AddSettingsCommand(settings, options, "set", "Write a value; the key is made when it is missing");
  name(set, "The value; an empty one is the key's unnamed one")->required();
  set->add_option("VALUE", options.value, "What it becomes: a text, a number, or bytes as hexadecimal digits")
      ->required();
  set->add_option("--type", options.type, "The kind of value: text, number, binary or expand")
      ->check(CLI::IsMember({"text", "number", "binary", "expand"}))
      ->type_name("TYPE")
      ->capture_default_str();
  CLI::App* list = AddSettingsCommand(settings, options, "list", "List the keys and values of a key");
  list->add_flag("--recursive", options.recursive, "And of the keys below it");
  list->add_flag("--json", options.json, "Print one JSON object instead of lines");
  CLI::App* remove = AddSettingsCommand(settings, options, "delete", "Delete a value or a key");
  name(remove, "A value of the key, or else a key below it; without it, the key itself");
  remove->add_flag("--recursive", options.recursive, "A key with everything below it");
}

int RunSettings(const CLI::App& settings, const SettingsOptions& options) {
  if (settings.got_subcommand("get")) return GetSetting(options);
  if (settings.got_subcommand("set")) return SetSetting(options);
  if (settings.got_subcommand("list")) return ListSettings(options);
  return DeleteSetting(options);
}

CLI::App* AddIniCommand(CLI::App* ini, IniOptions& options, const char* name, const char* description) {
  CLI::App* command = ini->add_subcommand(name, description);
  command->set_version_flag("--version", kVersion);
  command->add_option("FILE", options.file, "The initialisation file")->required();
  return command;
}

void AddIni(CLI::App& app, IniOptions& options) {
  CLI::App* ini = app.add_subcommand("ini", "Read and change initialisation files");
  ini->require_subcommand(1);
  CLI::App* get = AddIniCommand(ini, options, "get", "Print the value of a key");
  get->add_option("SECTION", options.section, "The section")->required();
  get->add_option("KEY", options.key, "The key")->required();
  get->add_flag("--json", options.json, "Print one JSON object instead of a line");
  CLI::App* set = AddIniCommand(ini, options, "set", "Write a key; file and section are made when they are missing");
  set->add_option("SECTION", options.section, "The section")->required();
  set->add_option("KEY", options.key, "The key")->required();
  set->add_option("VALUE", options.value, "What its value becomes")->required();
  CLI::App* list = AddIniCommand(ini, options, "list", "List the keys of a section with their values");
  list->add_option("SECTION", options.section, "The section; without it, the sections are listed");
  list->add_flag("--json", options.json, "Print one JSON object instead of lines");
}

int RunIni(const CLI::App& ini, const IniOptions& options) {
  if (ini.got_subcommand("get")) return GetIni(options);
  if (ini.got_subcommand("set")) return SetIni(options);
  return ListIni(options);
}

void AddFind(CLI::App& app, FindOptions& options) {
  CLI::App* command = app.add_subcommand("find", "List the files, or the folders, of a tree");
  command->add_flag("--folders", options.folders, "List folders instead of files");
  command->add_flag("--sorted", options.sorted, "List in order of the paths");
  command->add_option("--match", options.match, "Only entries with one of these attributes: letters, or a number")
      ->type_name("ATTRS");
  command->add_option("--reject", options.reject, "Only entries with none of these attributes")->type_name("ATTRS");
  command->add_flag("--json", options.json, "Print one JSON object instead of lines");
  command->add_option("DIR", options.folder, "The folder to look in")->required();
  command->add_option("MASK", options.mask, "Only names that fit, * and ? standing for any characters")
      ->capture_default_str();
}

void AddSort(CLI::App& app, SortOptions& options) {
  CLI::App* command = app.add_subcommand("sort", "Sort the lines of a text file");
  command->add_option("--by", options.by, "The order: text, number (natural order) or length")
      ->check(CLI::IsMember({"text", "number", "length"}))
      ->type_name("ORDER")
      ->capture_default_str();
  command->add_flag("--ignore-case", options.ignoreCase, "Take capital and small letters as the same");
  command->add_flag("--reverse", options.reverse, "The last line first");
  command
      ->add_option("--from", options.from,
                   "The encoding of FILE, with +Detect as a hint only; without it, it is detected")
      ->type_name("NAME");
  command->add_option("FILE", options.file, "The file to read; - is standard input")->required();
}

void AddInfo(CLI::App& app, InfoOptions& options) {
  CLI::App* command = app.add_subcommand("info", "Tell size, times, attributes and names of files");
  command->add_flag("--json", options.json, "Print one JSON object instead of lines");
  command->add_option("FILE", options.files, "Files or folders")->required();
}

// What was wrong with the arguments, in one line.
std::string ReasonOf(const CLI::ParseError& error, const CLI::App& app) {
  const CLI::App* innermost = &app;
  while (!innermost->get_subcommands().empty()) innermost = innermost->get_subcommands().front();
  const bool wantsCommand = !innermost->get_subcommands([](const CLI::App*) { return true; }).empty();
  const std::vector<std::string> strangers = wantsCommand ? app.remaining(true) : std::vector<std::string>();
  if (strangers.empty()) return error.what();
  const std::string place = innermost == &app ? "" : " " + innermost->get_name();
  return "\"" + strangers.front() + "\" is no command; qxtool" + place + " --help lists them";
}

int Run(std::vector<std::string> arguments) {
  CLI::App app("Converts text files, reads zip archives, finds, sorts and describes files, and keeps settings.",
               "qxtool");
  // A path may begin with a slash.
  app.allow_windows_style_options(false);
  app.set_version_flag("--version", kVersion);
  app.require_subcommand(1);
  DetectOptions detect;
  TextPipeOptions convert, escape, unescape;
  EncodingsOptions encodings;
  FindOptions find;
  SortOptions sort;
  InfoOptions info;
  AddDetect(app, detect);
  AddTextPipe(app, convert, "convert", "Convert a text file to another encoding");
  AddTextPipe(app, escape, "escape", "Turn a text file into 7-bit text with Unicode escapes");
  AddTextPipe(app, unescape, "unescape", "Turn Unicode escapes back into text");
  AddEncodings(app, encodings);
  ZipOptions zip;
  AddZip(app, zip);
  SettingsOptions settings;
  IniOptions ini;
  AddSettings(app, settings);
  AddIni(app, ini);
  AddFind(app, find);
  AddSort(app, sort);
  AddInfo(app, info);
  for (CLI::App* command : app.get_subcommands({})) command->set_version_flag("--version", kVersion);

  std::reverse(arguments.begin(), arguments.end());  // as the parser wants them
  try {
    app.parse(std::move(arguments));
  } catch (const CLI::ParseError& e) {
    if (e.get_exit_code() != 0) throw Failure{ReasonOf(e, app), kWrongUsage};
    std::ostringstream help, none;
    app.exit(e, help, none);
    Print(help.str());
    return kDone;
  }
  if (app.got_subcommand("detect")) return Detect(detect);
  if (app.got_subcommand("convert")) return Convert(convert);
  if (app.got_subcommand("escape")) return Escape(escape);
  if (app.got_subcommand("unescape")) return Unescape(unescape);
  if (app.got_subcommand("zip")) return RunZip(*app.get_subcommand("zip"), zip);
  if (app.got_subcommand("settings")) return RunSettings(*app.get_subcommand("settings"), settings);
  if (app.got_subcommand("ini")) return RunIni(*app.get_subcommand("ini"), ini);
  if (app.got_subcommand("find")) return Find(find);
  if (app.got_subcommand("sort")) return Sort(sort);
  if (app.got_subcommand("info")) return Info(info);
  return ListEncodings(encodings);
}

}  // namespace

int main(int argc, char** argv) {
  console::SetUp();
  try {
    int code = Run(console::Arguments(argc, argv));
    FlushPrinted();
    return code;
  } catch (const BrokenPipe&) {
    // The buffered rest has no reader, either; leave without trying to write it.
    std::_Exit(kDone);
  } catch (const SEIOAbortedException&) {
    Complain("cancelled");
    return kCancelled;
  } catch (const Failure& failure) {
    Complain(failure.place.empty() ? failure.text : failure.place + ": " + failure.text);
    return failure.code;
  } catch (...) {
    Complain(ReasonOfCurrentException());
    return kFailed;
  }
}
