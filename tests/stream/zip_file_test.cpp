// Archives listed through their central directory, and single entries taken out.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/win32.h"
#include "qxcore/stream/zip/internal/zip_format.h"
#include "qxcore/stream/zip/zip_file.h"
#include "qxcore/system/time/time.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

namespace {

using test::TempFolder;
using test::ZipBuilder;
using test::ZipPart;

class ZipFileTest : public testing::Test {
 protected:
  SString Write(const std::string& bytes, const WCHAR* name = WTEXT("a.zip")) {
    EXPECT_TRUE(test::WriteAll(m_folder.File(name), bytes));
    return Path(name);
  }
  SString Path(const WCHAR* name) const { return SString(m_folder.File(name).c_str()); }

  // What the archive holds, or how reading it ends.
  std::vector<std::string> List(const std::string& bytes) {
    std::vector<std::string> names;
    const SString path = Write(bytes);
    try {
      SZipFile zip(path);
      for (int found = zip.FindFile(WTEXT("*"), ~0ul); found != 0; found = zip.FindNextFile())
        names.push_back(Narrow(zip.GetEntry().GetName()));
      if (zip.HasFailed()) names.push_back("failed: " + Narrow(zip.GetFailure()));
      EXPECT_EQ(zip.FindNextFile(), 0);
    } catch (const SEZipException& e) {
      EXPECT_EQ(e.GetCode(), kSZipFailed);
      names.push_back("thrown: " + Narrow(e.GetText()));
    }
    return names;
  }
  static std::string Narrow(const SString& text) { return test::Narrow(test::Text(text.begin(), text.end())); }

  TempFolder m_folder;
};

using Names = std::vector<std::string>;

ZipBuilder Sound() {
  ZipBuilder zip;
  zip.parts.emplace_back("stored.txt", "stored text", false);
  zip.parts.emplace_back("folder/", "", false);
  zip.parts.emplace_back("folder/deflated.txt", std::string(100000, 'a'));
  zip.parts.back().comment = "a comment";
  zip.parts.emplace_back("k\xC3\xA4se", "later");
  zip.parts.back().flags = 0x808;
  zip.parts.back().comment = "\xE2\x82\xAC";
  zip.parts.back().extra = std::string(100, 'x');
  return zip;
}

TEST_F(ZipFileTest, EntriesComeWithTheirFields) {
  const ZipBuilder builder = Sound();
  const SString path = Write(builder.Make());
  SZipFile zip(path);
  EXPECT_EQ(zip.GetCount(), 4u);
  for (int round = 0; round < 2; ++round) {
    ASSERT_TRUE(zip.FindFile(nullptr, 0));
    for (const ZipPart& part : builder.parts) {
      const SZipEntry& entry = zip.GetEntry();
      EXPECT_EQ(entry.GetCRC(), part.crc);
      EXPECT_EQ(entry.GetSize(), static_cast<std::int64_t>(part.size));
      EXPECT_EQ(entry.GetCompressedSize(), static_cast<std::int64_t>(part.data.size()));
      EXPECT_EQ(entry.GetFlags(), part.flags);
      EXPECT_EQ(zip.MatchesMask(0x10), part.name == "folder/");
      EXPECT_EQ(zip.MatchesMask(0x800), part.method == 8);
      EXPECT_TRUE(zip.MatchesMask(1));
      EXPECT_FALSE(zip.MatchesMask(0x20));
      STime time;
      EXPECT_TRUE(zip.GetCreationTime(&time));
      EXPECT_EQ(time, STime(entry.GetTime()));
      EXPECT_FALSE(zip.GetCreationTime(nullptr));
      EXPECT_EQ(Narrow(entry.GetComment()), part.comment);
      EXPECT_EQ(zip.GetDisplayName(), path + WTEXT("\\") + entry.GetName());
      EXPECT_EQ(zip.FindNextFile(), &part != &builder.parts.back());
    }
    EXPECT_FALSE(zip.HasFailed());
    EXPECT_EQ(zip.GetEntry().GetName(), SString(WTEXT("k\u00E4se")));
  }
}

TEST_F(ZipFileTest, TheEndIsFoundBehindEveryCommentItCanHave) {
  for (std::size_t length : {0u, 1u, 41u, 42u, 43u, 63u, 64u, 65u, 1000u, 65512u, 65513u}) {
    ZipBuilder zip = Sound();
    zip.comment.assign(length, 'P');
    EXPECT_EQ(List(zip.Make()).size(), 4u) << length;
  }
  ZipBuilder zip = Sound();
  zip.comment.assign(65514, 'P');
  EXPECT_EQ(List(zip.Make()), Names{"thrown: END header not found"});
  // A signature in the comment is none, but where its record would end with the file.
  zip.comment = "PK\x05\x06" + std::string(200, '\0') + "PK\x05\x06";
  EXPECT_EQ(List(zip.Make()).size(), 4u);
  zip.comment = ZipBuilder().End(5, 0);
  EXPECT_EQ(List(zip.Make()), Names{"thrown: invalid END header format"});
  EXPECT_EQ(List(ZipBuilder().Make()), Names{});
}

TEST_F(ZipFileTest, BadArchivesEndInTheirTexts) {
  const auto with = [](void (*spoil)(ZipBuilder&)) {
    ZipBuilder zip = Sound();
    spoil(zip);
    return zip.Make();
  };
  const std::string sound = Sound().Make();
  EXPECT_EQ(List(""), Names{"thrown: END header not found"});
  EXPECT_EQ(List("PK\x05\x06"), Names{"thrown: END header not found"});
  EXPECT_EQ(List(sound + "behind"), Names{"thrown: END header not found"});
  EXPECT_EQ(List("in front" + sound), Names{"thrown: invalid END header format"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.further = 1; })), Names{"thrown: invalid END header format"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.moreEntries = 60000; })), Names{"thrown: invalid END header format"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.moreOnDisk = -1; })), Names{"thrown: cannot have more than one drive"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.parts[0].method = 12; })), Names{"thrown: invalid compression method"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.parts[0].centralSignature = 1; })),
            Names{"thrown: invalid CEN header signature"});
  // Sums of 32-bit fields that would wrap.
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.parts[0].compressedSize = 0xFFFFFFFF; })),
            Names{"thrown: invalid CEN entry size"});
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.longer = -0x1000, z.further = 0x1000; })),
            Names{"thrown: invalid END header format"});
  // Behind the first entry nothing is thrown.
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.parts[1].method = 9; })),
            (Names{"stored.txt", "failed: invalid compression method"}));
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.moreEntries = 1; })).back(), "failed: ");
  EXPECT_EQ(List(with([](ZipBuilder& z) { z.moreEntries = 1, z.comment.assign(100, 'c'); })).back(),
            "failed: invalid CEN header signature");
  EXPECT_THROW(SZipFile(Path(WTEXT("absent.zip"))), SEZipException);
  try {
    SZipFile zip(Path(WTEXT("absent.zip")));
  } catch (const SEZipException& e) {
    EXPECT_STREQ(Narrow(e.GetText()).c_str(), "");
  }
}

TEST_F(ZipFileTest, AnEntryThatReachesOutOfTheDirectoryIsRefused) {
  std::string bytes = Sound().Make();
  const std::size_t last = bytes.rfind("PK\x01\x02");
  bytes[last + 32] = '\xFF';  // the length of the comment
  EXPECT_EQ(List(bytes).back(), "failed: invalid CEN header format");
  // Also where only what the entries before have passed over shows it.
  ZipBuilder zip = Sound();
  for (ZipPart& part : zip.parts) part.extra.assign(40, 'x');
  bytes = zip.Make();
  bytes[bytes.rfind("PK\x01\x02") + 32] = 5;  // into the END record
  EXPECT_EQ(List(bytes).back(), "failed: invalid CEN header format");
}

// Others may write to the file.
TEST_F(ZipFileTest, AnArchiveThatIsCutWhileItIsListed_IsNoShorterOne) {
  ZipBuilder zip;
  for (int i = 0; i < 500; ++i) {
    zip.parts.emplace_back("entry " + std::to_string(i), "text", false);
    zip.parts.back().extra.assign(30, 'x');
    zip.parts.back().comment.assign(60, 'c');
  }
  const std::string bytes = zip.Make();
  const std::size_t directory = bytes.find("PK\x01\x02");
  for (std::size_t size = 0; size < bytes.size() - 22; size += size < directory ? directory : 911) {
    SZipFile archive(Write(bytes));
    const HANDLE file = CreateFileW(m_folder.File(WTEXT("a.zip")).c_str(), GENERIC_WRITE,
                                    FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr, OPEN_EXISTING, 0, nullptr);
    ASSERT_NE(file, INVALID_HANDLE_VALUE);
    LARGE_INTEGER end;
    end.QuadPart = static_cast<LONGLONG>(size);
    EXPECT_TRUE(SetFilePointerEx(file, end, nullptr, FILE_BEGIN) && SetEndOfFile(file));
    CloseHandle(file);
    int entries = 0;
    bool told = false;
    try {
      for (int found = archive.FindFile(nullptr, 0); found != 0; found = archive.FindNextFile()) {
        EXPECT_EQ(Narrow(archive.GetEntry().GetName()), "entry " + std::to_string(entries++));
      }
      told = archive.HasFailed() != 0;
    } catch (const SEZipException&) {
      told = true;
    }
    EXPECT_TRUE(told) << size << ": " << entries;
    EXPECT_LT(entries, 500) << size;
  }
}

// What the directory says of an entry, and what its own header and data say.
TEST_F(ZipFileTest, EntriesThatAreNotWhatTheDirectorySays) {
  const std::string sound = Sound().Make();
  const SString target = Path(WTEXT("out"));
  const struct {
    const char* name;
    std::size_t field;  // of the directory's record
    char value;
    const char* text;
  } cases[] = {
      {"stored.txt", 24, 5, "invalid entry size"},          {"stored.txt", 24, 120, "invalid entry size"},
      {"stored.txt", 16, 1, "invalid entry CRC"},           {"stored.txt", 42, 2, "invalid LOC header signature"},
      {"folder/deflated.txt", 24, 1, "invalid entry size"}, {"folder/deflated.txt", 16, 1, "invalid entry CRC"}};
  for (const auto& each : cases) {
    std::string bytes = sound;
    std::size_t record = bytes.rfind(each.name);
    record = bytes.rfind("PK\x01\x02", record);
    bytes[record + each.field] = static_cast<char>(bytes[record + each.field] + each.value);
    try {
      SZipFile::ExtractFile(Write(bytes), SString(each.name), target);
      ADD_FAILURE() << each.name << ' ' << each.field;
    } catch (const SEZipException& e) {
      EXPECT_EQ(Narrow(e.GetText()), each.text);
    }
    EXPECT_EQ(GetFileAttributesW(target), INVALID_FILE_ATTRIBUTES);
  }
}

// Every length of the file and every single wrong byte: an answer, or an exception of the right kind.
TEST_F(ZipFileTest, DamageNeverDoesMoreThanThrow) {
  const std::string sound = Sound().Make();
  for (std::size_t i = 0; i < sound.size(); ++i) {
    List(sound.substr(0, i));
    std::string bytes = sound;
    bytes[i] = static_cast<char>(~bytes[i]);
    List(bytes);
  }
}

TEST_F(ZipFileTest, ExtractsOneEntry) {
  ZipBuilder zip = Sound();
  const SString archive = Write(zip.Make()), target = Path(WTEXT("out"));
  SZipFile::ExtractFile(archive, WTEXT("folder/deflated.txt"), target);
  EXPECT_EQ(test::ReadAll(m_folder.File(WTEXT("out"))), std::string(100000, 'a'));
  SZipFile::ExtractFile(archive, WTEXT("k\u00E4se"), target);
  EXPECT_EQ(test::ReadAll(m_folder.File(WTEXT("out"))), "later");
  EXPECT_THROW(SZipFile::ExtractFile(archive, WTEXT("STORED.TXT"), target), SEZipException);
  EXPECT_EQ(test::ReadAll(m_folder.File(WTEXT("out"))), "later");  // nothing was begun
  EXPECT_THROW(SZipFile::ExtractFile(archive, WTEXT("stored.txt"), Path(WTEXT("no\\such\\folder"))),
               SEIOCantOpenForWriting);

  zip.parts[2].crc ^= 1;
  const SString damaged = Write(zip.Make(), WTEXT("b.zip"));
  EXPECT_THROW(SZipFile::ExtractFile(damaged, WTEXT("folder/deflated.txt"), target), SEZipException);
  EXPECT_EQ(GetFileAttributesW(target), INVALID_FILE_ATTRIBUTES);  // half a file is none
}

TEST_F(ZipFileTest, MemoryOutIsSaidAsSuch) {
  const SString archive = Write(Sound().Make()), target = Path(WTEXT("out"));
  const int failures = WithEachAllocationFailing(
      [&] {
        DeleteFileW(target);
        SZipFile::ExtractFile(archive, WTEXT("k\u00E4se"), target);
      },
      [&] { EXPECT_EQ(GetFileAttributesW(target), INVALID_FILE_ATTRIBUTES); });
  EXPECT_GE(failures, 4);
  EXPECT_EQ(test::ReadAll(m_folder.File(WTEXT("out"))), "later");
}

}  // namespace
