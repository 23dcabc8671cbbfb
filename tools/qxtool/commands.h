// The commands of the tool and what can be asked of each. A command returns its exit code, or throws
// Failure, SException or BrokenPipe for main to report.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct DetectOptions {
  std::string hint = "ANSI";
  std::string level;  // none, quick, fair or full; empty: what the hint's suffixes say, or full
  std::string favor;  // hint, guess or none; empty: what the hint's suffixes say, or guess
  bool fullUnicode = true;
  bool json = false;
  std::vector<std::string> files;
};
int Detect(const DetectOptions& options);

// Text files to others: convert, and with the text changed escape and unescape.
struct TextPipeOptions {
  std::string from;  // empty: detect as Detect does
  std::string to = "UTF-8";
  std::string replacement;  // one character, "drop", or empty for the library's own
  bool lossless = false;
  bool ifChanged = false;
  bool fullUnicode = true;
  std::string outputDir;  // where the new files go, under the names of the old ones
  bool inPlace = false;
  bool recursive = false;
  bool quiet = false;
  bool verbose = false;
  std::vector<std::string> files;  // one and its target, or any number with one of the options for where to write
};
int Convert(const TextPipeOptions& options);
int Escape(const TextPipeOptions& options);
int Unescape(const TextPipeOptions& options);

struct EncodingsOptions {
  bool installed = false;
  bool json = false;
};
int ListEncodings(const EncodingsOptions& options);

struct ZipOptions {
  std::string archive;
  std::string entry;                           // of extract: the name as list shows it
  std::string out;                             // of extract: a file, or "-"; of extract-all: a folder
  std::uint64_t maxBytes = ~std::uint64_t{0};  // of extract-all
  bool force = false;                          // of extract-all: replace files
  bool json = false;                           // of list
};
int ListZip(const ZipOptions& options);
int TestZip(const ZipOptions& options);
int ExtractZipEntry(const ZipOptions& options);
int ExtractZip(const ZipOptions& options);

// Settings below the library's key of the registry.
struct SettingsOptions {
  std::string path;
  std::string name;  // empty: the unnamed value
  bool hasName = false;
  std::string value;
  std::string type = "text";  // text, number, binary or expand
  bool recursive = false;
  bool json = false;
};
int GetSetting(const SettingsOptions& options);
int SetSetting(const SettingsOptions& options);
int ListSettings(const SettingsOptions& options);
int DeleteSetting(const SettingsOptions& options);

// Initialisation files.
struct IniOptions {
  std::string file;
  std::string section;  // of list: empty for the sections themselves
  std::string key;
  std::string value;
  bool json = false;
};
int GetIni(const IniOptions& options);
int SetIni(const IniOptions& options);
int ListIni(const IniOptions& options);

struct FindOptions {
  std::string folder;
  std::string mask = "*.*";
  bool folders = false;
  bool sorted = false;
  std::string match;    // attributes, see attributes.h; empty: all entries
  std::string reject;   // empty: none
  bool native = false;  // paths of the system
  bool nulls = false;   // NUL behind each instead of a line end
  bool json = false;
};
int Find(const FindOptions& options);

struct SortOptions {
  std::string by = "text";  // text, number or length
  bool ignoreCase = false;
  bool reverse = false;
  std::string from;  // empty: detect as Detect does
  bool fullUnicode = true;
  std::string file;
};
int Sort(const SortOptions& options);

struct InfoOptions {
  bool json = false;
  std::vector<std::string> files;
};
int Info(const InfoOptions& options);
