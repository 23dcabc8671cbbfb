// SProfile and the initialisation files below it: texts of all encodings, what a write leaves alone.

#include "qxcore/system/settings/profile.h"

#include <gtest/gtest.h>

#include <map>

#include "qxcore/platform/wide.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/file_size_limit.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::WriteAll;

std::string Utf16(const WideString& text) {
  return std::string(reinterpret_cast<const char*>(text.data()), text.size() * sizeof(WCHAR));
}

class Profile : public testing::Test {
 protected:
  Profile() : m_path(m_folder.File(WTEXT("a.ini"))) {}

  SProfile Section(const WCHAR* name = WTEXT("Section")) const { return SProfile(m_path.c_str(), name, 0); }
  SString Text(const WCHAR* key, const WCHAR* section = WTEXT("Section")) const {
    SString text;
    EXPECT_EQ(Section(section).GetProfile(key, &text, SString(WTEXT("default"))), S_OK);
    return text;
  }
  // What the file holds after one write of "new".
  std::string After(const std::string& before, const WCHAR* section, const WCHAR* key) {
    WriteAll(m_path, before);
    EXPECT_EQ(Section(section).WriteProfile(key, SString(WTEXT("new"))), S_OK);
    return ReadAll(m_path);
  }

  TempFolder m_folder;
  test::Text m_path;
};

// Values are cut, defaults are not.
TEST_F(Profile, DefaultsOfAnyLengthComeBackWhole) {
  for (const int length : {0, 1, 254, 255, 256, 257, 3000}) {
    SString standard, text;
    for (int i = 0; i < length; ++i) standard += static_cast<WCHAR>('a' + i % 26);
    EXPECT_EQ(Section().GetProfile(WTEXT("none"), &text, standard), S_OK);
    EXPECT_EQ(text, standard) << length;
  }
}

TEST_F(Profile, TypedValues) {
  SProfile profile = Section();
  int truth = 9;
  long number = 9;
  SString text;
  EXPECT_EQ(profile.GetProfile(WTEXT("none"), &truth, 1), S_OK);  // there is no file
  EXPECT_EQ(truth, 1);
  EXPECT_EQ(profile.GetProfile(WTEXT("none"), &number, -77L), S_OK);
  EXPECT_EQ(number, -77);
  EXPECT_EQ(profile.WriteProfile(WTEXT("truth"), 1), S_OK);
  EXPECT_EQ(profile.WriteProfile(WTEXT("number"), -2147483647L), S_OK);
  EXPECT_EQ(profile.WriteProfile(WTEXT("text"), SString(WTEXT("a = b; c"))), S_OK);
  EXPECT_EQ(profile.WriteProfile(WTEXT("empty"), SString()), S_OK);
  EXPECT_EQ(Text(WTEXT("TRUTH")), SString(WTEXT("1")));
  EXPECT_EQ(profile.GetProfile(WTEXT("truth"), &truth, 0), S_OK);
  EXPECT_EQ(truth, 1);
  EXPECT_EQ(profile.GetProfile(WTEXT("number"), &number, 0L), S_OK);
  EXPECT_EQ(number, -2147483647);
  EXPECT_EQ(Text(WTEXT("text")), SString(WTEXT("a = b; c")));
  EXPECT_EQ(Text(WTEXT("empty")), SString(WTEXT("default")));
  EXPECT_EQ(profile.GetProfile(WTEXT("empty"), &number, 5L), S_OK);
  EXPECT_EQ(number, 0);
  profile.WriteProfile(WTEXT("yes"), SString(WTEXT("yes")));
  EXPECT_EQ(profile.GetProfile(WTEXT("yes"), &truth, 0), S_OK);
  EXPECT_EQ(truth, 1);
  profile.WriteProfile(WTEXT("long"), SString(WideString(300, 'x').c_str()));
  EXPECT_EQ(Text(WTEXT("long")).Length(), 255);
  EXPECT_EQ(profile.GetProfile(WTEXT("x"), static_cast<int*>(nullptr), 0), E_POINTER);
  EXPECT_EQ(ReadAll(m_path).substr(0, 22), "[Section]\r\ntruth=1\r\nnu");
  profile.Done();
  EXPECT_TRUE(profile.GetFile().IsEmpty());
}

TEST_F(Profile, FailedWritesSaySo) {
  SProfile profile(m_folder.File(WTEXT("no\\such\\folder.ini")).c_str(), WTEXT("s"), 0);
  EXPECT_EQ(profile.WriteProfile(WTEXT("k"), 1), static_cast<HRESULT>(0xC0000000));
  WriteAll(m_path, "[s]\r\nk=old\r\n");
  if (IsWine()) return;  // which overlooks the attribute
  SetFileAttributesW(m_path.c_str(), FILE_ATTRIBUTE_READONLY);
  EXPECT_EQ(SProfile(m_path.c_str(), WTEXT("s"), 0).WriteProfile(WTEXT("k"), 1), static_cast<HRESULT>(0xC0000000));
  EXPECT_EQ(ReadAll(m_path), "[s]\r\nk=old\r\n");
}

TEST_F(Profile, ReadsWhatPeopleWrite) {
  WriteAll(m_path,
           "before=any section\n"
           "; key=comment\n"
           "[Other]\nkey=other\n"
           "  [ SECTION ] ; of interest\r\n"
           "  Key One \t=  value one \t\r\n"
           "quoted=\"  in quotes  \"\n"
           "single='x'\n"
           "half=\"x\n"
           "a=b=c\n"
           "no value\n"
           "key=first\n"
           "key=second\n"
           "[section]\nlater=unseen\n"
           "[Third]\nlast=no line end");
  EXPECT_EQ(Text(WTEXT("key one")), SString(WTEXT("value one")));
  EXPECT_EQ(Text(WTEXT("quoted")), SString(WTEXT("  in quotes  ")));
  EXPECT_EQ(Text(WTEXT("single")), SString(WTEXT("x")));
  EXPECT_EQ(Text(WTEXT("half")), SString(WTEXT("\"x")));
  EXPECT_EQ(Text(WTEXT("a")), SString(WTEXT("b=c")));
  EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("first")));
  EXPECT_EQ(Text(WTEXT("before")), SString(WTEXT("default")));
  EXPECT_EQ(Text(WTEXT("no value")), SString(WTEXT("default")));
  EXPECT_EQ(Text(WTEXT("key"), WTEXT("OTHER")), SString(WTEXT("other")));
  EXPECT_EQ(Text(WTEXT("later")), SString(WTEXT("default")));
  EXPECT_EQ(Text(WTEXT("last"), WTEXT("third")), SString(WTEXT("no line end")));
}

// What Wine writes anew is in its own form; the rules are the portable layer's.
TEST_F(Profile, AWriteLeavesTheRestAlone) {
  if (IsWindows()) GTEST_SKIP() << "the system's own functions write here";
  EXPECT_EQ(
      After("; top\n\n[a]\nx = 1 \n\n[section]\n; about key\n Key = old\n\n[z]\n", WTEXT("Section"), WTEXT("KEY")),
      "; top\n\n[a]\nx = 1 \n\n[section]\n; about key\n Key = new\n\n[z]\n");
  EXPECT_EQ(After("[section]\r\na=1\r\n\r\n[z]\r\n", WTEXT("Section"), WTEXT("b")),
            "[section]\r\na=1\r\nb=new\r\n\r\n[z]\r\n");
  EXPECT_EQ(After("[section]\n; a comment stays", WTEXT("Section"), WTEXT("b")),
            "[section]\n; a comment stays\nb=new\n");
  EXPECT_EQ(After("junk \x81\xFF\n[broken\n", WTEXT("Section"), WTEXT("b")),
            "junk \x81\xFF\n[broken\n[Section]\nb=new\n");
  EXPECT_EQ(After("", WTEXT("Section"), WTEXT("b")), "[Section]\r\nb=new\r\n");
  EXPECT_EQ(After("\xEF\xBB\xBF[section]\nb=\xC3\xA9", WTEXT("Section"), WTEXT("b")), "\xEF\xBB\xBF[section]\nb=new\n");
  EXPECT_EQ(After("a\rb\r", WTEXT("Section"), WTEXT("b")), "a\rb\r[Section]\rb=new\r");
  const std::string reversed("\xFE\xFF\0[\0s\0]\0\n\0b\0=\0x", 16);
  EXPECT_EQ(After(reversed, WTEXT("s"), WTEXT("b")), reversed.substr(0, 14) + std::string("\0n\0e\0w\0\n", 8));
}

TEST_F(Profile, EncodingsOfTheFile) {
  WriteAll(m_path, "\xFF\xFE" + Utf16(WTEXT("[Section]\r\nkey=\x4E2D\x6587\r\n")));
  EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("\x4E2D\x6587")));
  EXPECT_EQ(Section().WriteProfile(WTEXT("\x3B1"), SString(WTEXT("\x3B2\xE9"))), S_OK);
  EXPECT_EQ(Text(WTEXT("\x3B1")), SString(WTEXT("\x3B2\xE9")));
  EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("\x4E2D\x6587")));
  EXPECT_EQ(ReadAll(m_path).substr(0, 2), "\xFF\xFE");
  WriteAll(m_path, "[Section]\r\nkey=\xE9\x80\r\n");
  if (GetACP() == 1252) {
    EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("\xE9\x20AC")));
    EXPECT_EQ(Section().WriteProfile(WTEXT("b"), SString(WTEXT("\x20AC\x4E2D"))), S_OK);
    EXPECT_EQ(Text(WTEXT("b")), SString(WTEXT("\x20AC?")));  // what the code page does not have
  }
}

#ifndef _WIN32
// Nothing could follow half a character.
TEST_F(Profile, AFileThatEndsInHalfACharacterCanBeWrittenOn) {
  for (const bool isReversed : {false, true}) {
    std::string bytes = "\xFF\xFE" + Utf16(WTEXT("[Section]\r\nkey=1"));
    for (std::size_t i = 0; isReversed && i < bytes.size(); i += 2) std::swap(bytes[i], bytes[i + 1]);
    WriteAll(m_path, bytes + 'x');
    EXPECT_EQ(Section().WriteProfile(WTEXT("added"), SString(WTEXT("2"))), S_OK);
    EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("1")));
    EXPECT_EQ(Text(WTEXT("added")), SString(WTEXT("2")));
    EXPECT_EQ(ReadAll(m_path).size() % 2, 0u);
  }
}
#endif

// The platform's own list forms, which the tool uses.
TEST_F(Profile, ListsOfSectionsAndKeys) {
  WriteAll(m_path, "[one]\nk1=1\nk2=2\n[two]\nk3=3\n");
  WCHAR text[32];
  EXPECT_EQ(GetPrivateProfileStringW(nullptr, nullptr, nullptr, text, 32, m_path.c_str()), 8u);
  EXPECT_EQ(WideString(text, 9), WideString(WTEXT("one\0two\0\0"), 9));
  EXPECT_EQ(GetPrivateProfileStringW(WTEXT("one"), nullptr, nullptr, text, 32, m_path.c_str()), 6u);
  EXPECT_EQ(WideString(text, 7), WideString(WTEXT("k1\0k2\0\0"), 7));
  EXPECT_EQ(GetPrivateProfileStringW(WTEXT("one"), nullptr, nullptr, text, 5, m_path.c_str()), 3u);
  EXPECT_EQ(WideString(text, 3), WideString(WTEXT("k1\0"), 3));
  EXPECT_EQ(GetPrivateProfileStringW(WTEXT("none"), nullptr, nullptr, text, 32, m_path.c_str()), 0u);
  EXPECT_EQ(text[0], 0);
  EXPECT_EQ(GetPrivateProfileStringW(WTEXT("one"), WTEXT("k1"), nullptr, text, 1, m_path.c_str()), 0u);
  EXPECT_TRUE(WritePrivateProfileStringW(WTEXT("one"), WTEXT("k1"), nullptr, m_path.c_str()));
  EXPECT_EQ(Text(WTEXT("k1"), WTEXT("one")), SString(WTEXT("default")));
  EXPECT_TRUE(WritePrivateProfileStringW(WTEXT("one"), nullptr, nullptr, m_path.c_str()));
  EXPECT_EQ(Text(WTEXT("k2"), WTEXT("one")), SString(WTEXT("default")));
  EXPECT_EQ(Text(WTEXT("k3"), WTEXT("two")), SString(WTEXT("3")));
}

// Random writes beside a map of what should be there.
TEST_F(Profile, RandomWritesAgainstAMap) {
  for (const bool isWide : {false, true}) {
    WriteAll(m_path, isWide ? "\xFF\xFE" : "");
    std::map<std::pair<int, int>, WideString> expected;
    RandomText random(5);
    const WCHAR* const sections[] = {WTEXT("One"), WTEXT("t w o"), WTEXT("3]x")};
    const WCHAR* const sectionsAgain[] = {WTEXT("ONE"), WTEXT("T W O"), WTEXT("3]X")};
    for (int i = 0; i < 400; ++i) {
      const int section = random.Number(3), key = random.Number(12);
      WCHAR name[8];
      platform::WideFormat(name, 8, WTEXT("k%d"), key);
      if (random.Number(6) == 0) {
        WritePrivateProfileStringW(sections[section], name, nullptr, m_path.c_str());
        expected.erase({section, key});
      } else {
        WideString value = WTEXT("v");
        value += random.Make(20, WTEXT("ab =;[]\"'\x20AC\xE9")) + WTEXT("v");
        ASSERT_EQ(SProfile(m_path.c_str(), sections[section], 0).WriteProfile(name, SString(value.c_str())), S_OK);
        expected[{section, key}] = value;
      }
      if (i % 20 != 0) continue;
      for (int s = 0; s < 3; ++s) {
        for (int k = 0; k < 12; ++k) {
          platform::WideFormat(name, 8, WTEXT("K%d"), k);
          const auto found = expected.find({s, k});
          ASSERT_EQ(Text(name, sectionsAgain[s]),
                    SString(found == expected.end() ? WTEXT("default") : found->second.c_str()))
              << i;
        }
      }
    }
  }
}

#ifndef _WIN32
TEST_F(Profile, AFullDiskLeavesTheFileAsItWas) {
  const std::string before = "[Section]\n; " + std::string(5000, 'x') + "\nkey=old\n";
  WriteAll(m_path, before);
  HRESULT result;
  DWORD error;
  {
    const test::FileSizeLimit limit(4096);
    result = Section().WriteProfile(WTEXT("key"), SString(WTEXT("new")));
    error = GetLastError();
  }
  EXPECT_EQ(result, static_cast<HRESULT>(0xC0000000));
  EXPECT_NE(error, 0u);
  EXPECT_EQ(ReadAll(m_path), before);
  // And no temporary file.
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(m_folder.File(WTEXT("a.ini*")).c_str(), &data);
  EXPECT_FALSE(FindNextFileW(search, &data));
  FindClose(search);
  EXPECT_EQ(Section().WriteProfile(WTEXT("key"), SString(WTEXT("new"))), S_OK);
  EXPECT_EQ(Text(WTEXT("key")), SString(WTEXT("new")));
}
#endif

TEST_F(Profile, EachAllocationFailing) {
  const SString value(WideString(200, 'v').c_str());
  SProfile profile = Section();
  profile.WriteProfile(WTEXT("key"), value);
  WithEachAllocationFailing(
      [&] {
        profile.WriteProfile(WTEXT("key"), value);
        profile.WriteProfile(WTEXT("other"), 5L);
        SString text;
        profile.GetProfile(WTEXT("key"), &text, SString());
      },
      [&] { EXPECT_EQ(Text(WTEXT("key")), value); });
}

}  // namespace
