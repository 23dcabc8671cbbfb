// RTF: merging two font tables of 1,000 entries, beside the loop over all entries that the rule describes; and
// the text of 10 MB of real documents, beside memcpy of the same string and the converters catdoc and unrtf.
//
// The documents are those of QXCORE_CORPUS: the bodies of all whose groups are closed, one after the other, again
// and again, in one document; without the corpus there is no such row. The converters are processes that read
// a file in the page cache; ours has the text in memory.

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "bench/bench.h"
#include "qxcore/graphics/rtf/font_table.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/ui/rtf/document.h"

namespace {

constexpr int kFonts = 1000;
constexpr std::size_t kDocumentBytes = 10 << 20;

// Every second name is in the table of the other number, too.
SString FontTableText(int first) {
  SString text(WTEXT("{\\fonttbl\r\n"));
  for (int i = 0; i < kFonts; ++i) {
    SString entry;
    entry.Format(WTEXT("{\\f%d\\fswiss\\fcharset0\\fprq2 Family %d Condensed;}\r\n"), i, i % 2 == 0 ? i : first + i);
    text += entry;
  }
  return text + WTEXT("}\r\n");
}

struct Merged {
  SRtfFontTable table;
  SString other = FontTableText(200000);
  Merged() { table.AddFontTable(FontTableText(100000)); }
};

const Merged& Tables() {
  static const Merged tables;
  return tables;
}

BENCH("merge two font tables of 1,000 entries/ours") {
  const Merged& tables = Tables();
  for (auto _ : state) {
    SRtfFontTable table(tables.table);
    benchmark::DoNotOptimize(table.AddFontTable(tables.other).size());
  }
}

// The rule as it is written: tag by tag, entry by entry.
SMap<int, int> MergeByLoop(SRtfFontTable& table, const SString& text) {
  SMap<int, int> numbers;
  const WCHAR* tag;
  long length;
  const WCHAR* at = text;
  SRtfDocument::GetNextTag(&tag, &length, at, 0);
  SRtfDocument::GetNextTag(&tag, &length, tag + length, 0);
  while (SRtfDocument::GetNextTag(&tag, &length, tag + length, 1) != 0 && *tag == '{') {
    SRtfFontEntry entry;
    if (entry.SetFontEntry(SString(SStringView(tag, static_cast<std::size_t>(length)))) == 0) continue;
    int place = 0;
    while (place < table.GetCount() && !(table.GetConst(place) == entry)) ++place;
    numbers.Add(entry.m_number, place);
    if (place < table.GetCount()) continue;
    entry.m_number = place;
    table.Add(entry);
  }
  return numbers;
}

BENCH("merge two font tables of 1,000 entries/plain loop") {
  const Merged& tables = Tables();
  for (auto _ : state) {
    SRtfFontTable table(tables.table);
    benchmark::DoNotOptimize(MergeByLoop(table, tables.other).size());
  }
}

// --- documents ---

SString ReadDocument(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  const std::string bytes(std::istreambuf_iterator<char>(file), {});
  std::basic_string<WCHAR> text;
  for (const char byte : bytes) text += static_cast<unsigned char>(byte);
  return SString(SStringView(text));
}

// The body as a group, or nothing when it cannot stand in another document.
SString BodyOf(SString document) {
  SString header, body(WTEXT("{"));
  if (SRtfDocument::ExtractHeader(document, header, 1) == 0) return SString();
  body += document;
  const WCHAR* group;
  long length;
  SRtfDocument::GetNextTag(&group, &length, body, 1);
  return body[length - 1] == '}' ? body.Left(static_cast<int>(length)) : SString();
}

const SString& Documents() {
  static const SString made = [] {
    const char* corpus = std::getenv("QXCORE_CORPUS");
    SString all(WTEXT("{\\rtf1\\ansi\\ansicpg1252\\deff0{\\fonttbl{\\f0\\fnil\\fcharset0 Arial;}}\r\n"));
    if (corpus == nullptr) return SString();
    std::vector<std::filesystem::path> paths;
    for (const auto& entry : std::filesystem::directory_iterator(std::filesystem::path(corpus) / "rtf" / "files"))
      paths.push_back(entry.path());
    std::sort(paths.begin(), paths.end());
    SString once;
    for (const auto& path : paths) once += BodyOf(ReadDocument(path));
    SStringBuffer text(static_cast<unsigned>(kDocumentBytes + (1 << 20)));
    text += all;
    while (!once.IsEmpty() && text.Length() < static_cast<int>(kDocumentBytes)) text += once;
    text += WTEXT("}");
    return once.IsEmpty() ? SString() : text.Detach();
  }();
  return made;
}

constexpr char kRow[] = "RTF to text, 10 MB of real documents/";

void RegisterDocumentRow(const char* peer, void (*function)(benchmark::State&)) {
  static std::vector<std::string> names;
  if (Documents().IsEmpty()) return;
  names.push_back(kRow + std::string(peer));
  benchmark::RegisterBenchmark(names.back().c_str(), function)->UseRealTime();
}

void Ours(benchmark::State& state) {
  SRtfDocument document;
  SString text;
  for (auto _ : state) {
    if (document.RtfToText(&text, Documents()) == 0) std::abort();
    benchmark::DoNotOptimize(text.Length());
  }
  state.SetBytesProcessed(state.iterations() * Documents().Length());
}

#if BENCH_PEERS

void Copy(benchmark::State& state) {
  const SString& text = Documents();
  std::vector<WCHAR> copy(static_cast<std::size_t>(text.Length()));
  for (auto _ : state) {
    std::memcpy(copy.data(), text.GetSafePointer(), copy.size() * sizeof(WCHAR));
    benchmark::DoNotOptimize(copy[0]);
    benchmark::ClobberMemory();
  }
}

const std::string& DocumentFile() {
  static const struct File {
    std::string path = (std::filesystem::temp_directory_path() / "qxbench.rtf").string();
    File() {
      std::string bytes;
      for (const WCHAR c : Documents()) bytes += static_cast<char>(c);
      std::ofstream(path, std::ios::binary) << bytes;
    }
    ~File() { std::filesystem::remove(path); }
  } file;
  return file.path;
}

template <int kPeer>
void RunPeer(benchmark::State& state) {
  constexpr const char* kCommands[] = {"catdoc -d utf-8 ", "unrtf --text --nopict "};
  const std::string command = kCommands[kPeer] + DocumentFile() + " >/dev/null 2>&1";
  for (auto _ : state) {
    if (std::system(command.c_str()) != 0) state.SkipWithError("cannot run the converter");
  }
}

#endif

[[maybe_unused]] const bool g_areRegistered = [] {
  RegisterDocumentRow("ours", Ours);
#if BENCH_PEERS
  RegisterDocumentRow("memcpy", Copy);
  RegisterDocumentRow("catdoc", RunPeer<0>);
  RegisterDocumentRow("unrtf", RunPeer<1>);
#endif
  return true;
}();

}  // namespace
