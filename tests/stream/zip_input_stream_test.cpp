// Archives read entry by entry, sound ones and every kind of bad one.

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/zip/internal/zip_format.h"
#include "qxcore/stream/zip/zip_input_stream.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/steps.h"
#include "tests/support/text.h"

namespace {

using test::ZipBuilder;
using test::ZipPart;

std::string ReadEntry(SZipInputStream& zip, unsigned long piece) {
  std::string all, block(piece, '\0');
  for (test::Steps steps; const unsigned long got = zip.Read(block.data(), piece); steps.Take())
    all.append(block, 0, got);
  return all;
}

// Reads all entries; gives what ended it: "end" or the exception's text.
std::string Outcome(const std::string& archive, int* entries = nullptr) {
  SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
  SZipInputStream zip(memory);
  try {
    for (test::Steps steps; zip.GetNextEntry() != nullptr; steps.Take()) {
      ReadEntry(zip, 1000);
      if (entries != nullptr) ++*entries;
    }
  } catch (const SEZipException& e) {
    EXPECT_EQ(e.GetCode(), kSZipFailed);
    const SString text = e.GetText();
    return std::string(text.begin(), text.end());
  } catch (const SEEOFException&) {
    return "EOF";
  }
  return "end";
}

std::string LongText() {
  std::string text;
  for (int i = 0; i < 20000; ++i) text += "line " + std::to_string(i * 7919 % 10007) + "\n";
  return text;
}

ZipBuilder Sound() {
  ZipBuilder zip;
  zip.parts.emplace_back("stored.txt", "stored text", false);
  zip.parts.emplace_back("folder/", "", false);
  zip.parts.emplace_back("folder/empty", "", false);
  zip.parts.emplace_back("deflated.txt", LongText());
  zip.parts.emplace_back("none", "");
  zip.parts.emplace_back("later.txt", LongText());
  zip.parts.back().flags = 8;
  zip.parts.emplace_back("k\xC3\xA4se \xF0\x9F\xA7\x80", "cheese");
  zip.parts.back().flags = 0x800;
  zip.parts.back().extra = std::string(3000, 'x');
  zip.parts.emplace_back("k\xE4se", "cheese", false);
  return zip;
}

TEST(ZipInputStream, EntriesComeWithTheirFieldsAndData) {
  const ZipBuilder builder = Sound();
  const std::string archive = builder.Make();
  for (unsigned long piece : {1ul, 511ul, 4096ul, 1000000ul}) {
    SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
    SZipInputStream zip(memory);
    std::int64_t offset = 0;
    for (const ZipPart& part : builder.parts) {
      SZipEntry* entry = zip.GetNextEntry();
      ASSERT_NE(entry, nullptr);
      EXPECT_EQ(entry->GetOffset(), offset);
      EXPECT_EQ(entry->GetMethod(), part.method);
      const bool later = part.flags == 8;
      EXPECT_EQ(entry->GetCRC(), later ? SZipEntry::kUnknown : static_cast<std::int64_t>(part.crc));
      EXPECT_EQ(entry->GetSize(), later ? SZipEntry::kUnknown : static_cast<std::int64_t>(part.size));
      EXPECT_EQ(entry->GetAttributes(), 1u | (part.method == 8 ? 0x800u : 0u) | (part.name == "folder/" ? 0x10u : 0u));
      SYSTEMTIME time;
      ASSERT_TRUE(FileTimeToSystemTime(&entry->GetTime(), &time));
      EXPECT_EQ(std::vector<int>({time.wYear, time.wMonth, time.wDay, time.wHour, time.wMinute, time.wSecond}),
                std::vector<int>({2026, 11, 21, 13, 34, 52}));
      EXPECT_EQ(zip.IsEOF(), part.method == 0 && part.size == 0);
      EXPECT_EQ(ReadEntry(zip, piece).size(), part.size);
      EXPECT_TRUE(zip.IsEOF());
      EXPECT_EQ(zip.GetCRC(), part.crc);
      EXPECT_EQ(entry->GetCRC(), part.crc);
      EXPECT_EQ(entry->GetSize(), static_cast<std::int64_t>(part.size));
      EXPECT_EQ(entry->GetCompressedSize(), static_cast<std::int64_t>(part.data.size()));
      EXPECT_EQ(zip.Read(), -1);
      offset += static_cast<std::int64_t>(part.Local().size());
      EXPECT_EQ(zip.GetPosition(), offset);
    }
    EXPECT_EQ(zip.GetNextEntry(), nullptr);
    EXPECT_EQ(zip.GetNextEntry(), nullptr);
  }
}

TEST(ZipInputStream, NamesAreDecodedByTheirFlag) {
  const std::string archive = Sound().Make();
  SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
  SZipInputStream zip(memory);
  std::vector<SString> names;
  for (test::Steps steps; const SZipEntry* entry = zip.GetNextEntry(); steps.Take())
    names.push_back(entry->GetName());  // unread entries are passed
  ASSERT_EQ(names.size(), 8u);
  EXPECT_EQ(names[6], SString(WTEXT("k\u00E4se \U0001F9C0")));
  EXPECT_EQ(names[7], SString("k\xE4se"));
}

TEST(ZipInputStream, NamesEndBeforeANul) {
  for (const unsigned flags : {0u, 0x800u}) {
    for (const std::string& name : {std::string("ab\0c", 4), std::string("\0", 1)}) {
      ZipBuilder built;
      built.parts.emplace_back(name, "text");
      built.parts.back().flags = flags;
      const std::string archive = built.Make();
      SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
      SZipInputStream zip(memory);
      const SZipEntry* entry = zip.GetNextEntry();
      ASSERT_NE(entry, nullptr);
      EXPECT_EQ(entry->GetName(), SString(name.c_str())) << flags;
    }
  }
}

TEST(ZipInputStream, BadHeadersAndDataEndInTheirTexts) {
  struct Case {
    const char* outcome;
    void (*spoil)(ZipPart& part);
  };
  const Case cases[] = {
      {"encrypted ZIP entry not supported", [](ZipPart& p) { p.flags = 1 | 8, p.method = 0; }},
      {"only DEFLATED entries can have EXT descriptor", [](ZipPart& p) { p.flags = 8, p.method = 0, p.name = ""; }},
      {"missing entry name", [](ZipPart& p) { p.name = ""; }},
      {"invalid compression method", [](ZipPart& p) { p.method = 12; }},
      {"Invalid ZLIB data format",
       [](ZipPart& p) { p.data[p.data.size() / 2] = static_cast<char>(~p.data[p.data.size() / 2]), p.data[0] = 7; }},
      {"invalid entry size", [](ZipPart& p) { p.size -= 1; }},
      {"invalid entry size", [](ZipPart& p) { p.size += 1; }},
      {"invalid entry compressed size", [](ZipPart& p) { p.compressedSize -= 1; }},
      {"invalid entry compressed size", [](ZipPart& p) { p.compressedSize += 1; }},
      {"invalid entry size", [](ZipPart& p) { p.flags = 8, p.size += 1; }},
      {"invalid entry compressed size", [](ZipPart& p) { p.flags = 8, p.compressedSize += 1; }},
      {"invalid EXT descriptor signature", [](ZipPart& p) { p.flags = 8, p.descriptor = 0x504B0708; }},
      {"ZIP64 entry not supported", [](ZipPart& p) { p.size = 0xFFFFFFFF; }},
      {"ZIP64 entry not supported", [](ZipPart& p) { p.compressedSize = 0xFFFFFFFF; }},
      {"invalid entry compressed size", [](ZipPart& p) { p.method = 0; }},
  };
  for (const Case& c : cases) {
    ZipBuilder zip;
    zip.parts.emplace_back("first", "sound", false);
    zip.parts.emplace_back("second", LongText());
    c.spoil(zip.parts.back());
    int entries = 0;
    EXPECT_EQ(Outcome(zip.Make(), &entries), c.outcome) << &c - cases;
    EXPECT_EQ(entries, 1);
  }
}

TEST(ZipInputStream, CutArchivesNeverPass) {
  ZipBuilder zip = Sound();
  zip.parts[3] = ZipPart("deflated.txt", LongText().substr(0, 3000));
  zip.parts[5] = ZipPart("later.txt", LongText().substr(0, 3000));
  zip.parts[5].flags = 8;
  zip.parts[6].extra.resize(40);
  const std::string locals = zip.Locals();
  ZipBuilder stored;
  stored.parts.emplace_back("stored.txt", "stored text", false);
  EXPECT_EQ(Outcome(stored.Locals().substr(0, 45)), "unexpected EOF");
  for (std::size_t cut = 0; cut <= locals.size(); ++cut) {
    const std::string outcome = Outcome(locals.substr(0, cut));
    EXPECT_TRUE(outcome == "EOF" || outcome == "unexpected EOF" || outcome == "Invalid ZLIB data format")
        << cut << outcome;
  }
  EXPECT_EQ(Outcome(ZipBuilder().Make()), "end");  // an empty archive is one
}

TEST(ZipInputStream, WhatIsLongerThanItsHeaderSaysEndsEarly) {
  ZipBuilder zip;
  zip.parts.emplace_back("bomb", std::string(50000000, '\0'));
  zip.parts.back().size = 1000;
  const std::string archive = zip.Make();
  SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
  SZipInputStream in(memory);
  ASSERT_NE(in.GetNextEntry(), nullptr);
  EXPECT_THROW(in.CloseEntry(), SEZipException);
  EXPECT_LT(memory.GetPos(), 2000u);
}

TEST(ZipInputStream, MemoryOutIsSaidAsSuch) {
  const std::string archive = Sound().Make();
  int entries = 0;
  const int failures = WithEachAllocationFailing(
      [&] {
        SInputBuffer memory(archive.data(), static_cast<unsigned long>(archive.size()));
        SZipInputStream zip(memory);
        for (entries = 0; zip.GetNextEntry() != nullptr; ++entries) zip.CloseEntry();
      },
      [] {});
  EXPECT_GE(failures, 4);
  EXPECT_EQ(entries, 8);
}

TEST(ZipInputStream, WhatIsLongerThanItsHeaderSaysEndsThere) {
  std::mt19937 random(1);
  std::string content(300000, '\0');
  for (char& byte : content) byte = static_cast<char>(random());
  for (const bool isCompressed : {true, false}) {
    test::ZipBuilder zip;
    zip.parts.emplace_back("long", content);
    (isCompressed ? zip.parts[0].compressedSize : zip.parts[0].size) = 1000;
    const std::string archive = zip.Make();
    SInputBuffer in(archive.data(), static_cast<unsigned long>(archive.size()));
    SZipInputStream stream(in);
    ASSERT_NE(stream.GetNextEntry(), nullptr);
    char block[512];
    unsigned long delivered = 0;
    const auto readAll = [&] {
      for (test::Steps steps; const unsigned long got = stream.Read(block, sizeof block); steps.Take())
        delivered += got;
    };
    EXPECT_THROW(readAll(), SEZipException);
    EXPECT_LT(delivered, 20000u) << "not only when all of it was read";
  }
}

}  // namespace
