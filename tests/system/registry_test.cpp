// SRegistry on the registry itself: opening, typed values, oddities that are meant, enumeration, deletion.

#include "qxcore/system/settings/registry.h"

#include <gtest/gtest.h>

#ifndef _WIN32
#include <sqlite3.h>
#endif

#include <algorithm>
#include <atomic>
#include <cstring>
#include <thread>

#include "qxcore/system/hglobal.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/file_size_limit.h"
#include "tests/support/registry_root.h"
#include "tests/support/text.h"

namespace {

using test::RegistryRoot;

constexpr HRESULT kMissing = static_cast<HRESULT>(SRegistry::kDefaultUsed);

class Registry : public testing::Test {
 protected:
  Registry() : m_key(HKEY_CURRENT_USER, RegistryRoot::Path(), 1) { EXPECT_TRUE(m_key.IsOpen()); }

  void Put(const WCHAR* name, DWORD type, const std::string& bytes) {
    ASSERT_EQ(RegSetValueExW(m_key.GetKey(), name, 0, type, reinterpret_cast<const BYTE*>(bytes.data()),
                             static_cast<DWORD>(bytes.size())),
              0);
  }
  void PutText(const WCHAR* name, const WCHAR* text, DWORD type = REG_SZ) {
    Put(name, type, std::string(reinterpret_cast<const char*>(text), (SString(text).Length() + 1u) * sizeof(WCHAR)));
  }
  SString Text(const WCHAR* name, const WCHAR* standard = WTEXT("default")) const {
    SString text(WTEXT("before"));
    m_key.GetProfile(name, &text, SString(standard));
    return text;
  }
  int Truth(const WCHAR* name, int standard = 0) const {
    int truth = -7;
    m_key.GetProfile(name, &truth, standard);
    return truth;
  }
  long Number(const WCHAR* name, long standard = -1) const {
    long number = -7;
    m_key.GetProfile(name, &number, standard);
    return number;
  }

  RegistryRoot m_root;
  SRegistry m_key;
};

TEST_F(Registry, OpeningAndCreating) {
  const SString path = SString(RegistryRoot::Path()) + WTEXT("\\sub\\\\");
  SRegistry key;
  EXPECT_EQ(key.Init(HKEY_CURRENT_USER, path, 0), E_FAIL);
  EXPECT_FALSE(key.IsOpen());
  EXPECT_EQ(key.Init(HKEY_LOCAL_MACHINE, path, 1), E_FAIL);  // never made there
  EXPECT_EQ(key.Init(nullptr, path, 0), E_FAIL);
  EXPECT_EQ(key.Init(nullptr, path, 1), S_OK);  // below the current user
  EXPECT_EQ(key.GetPath(), path);
  EXPECT_EQ(key.GetCreate(), 1);
  EXPECT_EQ(SRegistry(HKEY_CURRENT_USER, path, 0).IsOpen(), 1);
  // The same path and flag: the key stays open, whatever the root.
  const HKEY handle = key.GetKey();
  EXPECT_EQ(key.Init(HKEY_LOCAL_MACHINE, path, 1), S_OK);
  EXPECT_EQ(key.GetKey(), handle);
  EXPECT_EQ(key.Init(HKEY_LOCAL_MACHINE, path, 0), E_FAIL);
  EXPECT_FALSE(key.IsOpen());
  EXPECT_EQ(key.Init(nullptr, key.GetPath(), 1), S_OK);
  EXPECT_EQ(key.GetCreate(), 0);  // it was found, not made
  key.Done();
  EXPECT_FALSE(key.IsOpen());
  EXPECT_TRUE(key.GetPath().IsEmpty());
}

TEST_F(Registry, NullRootFindsKeysOfTheMachine) {
  HKEY made;
  if (RegCreateKeyExW(HKEY_LOCAL_MACHINE, RegistryRoot::Path(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &made,
                      nullptr) != 0)
    GTEST_SKIP() << "the machine's part of the registry cannot be written";
  RegCloseKey(made);
  SRegistry machine(HKEY_LOCAL_MACHINE, RegistryRoot::Path(), 1);
  EXPECT_EQ(machine.WriteProfile(WTEXT("where"), SString(WTEXT("machine"))), S_OK);
  m_key.WriteProfile(WTEXT("where"), SString(WTEXT("user")));
  SRegistry found(nullptr, RegistryRoot::Path(), 0);
  SString where;
  found.GetProfile(WTEXT("where"), &where, SString());
  EXPECT_EQ(where, SString(WTEXT("user")));
  found.Done();
  m_key.DeleteKey(SString(), 1);
  m_key.Done();
  EXPECT_EQ(found.Init(nullptr, RegistryRoot::Path(), 0), S_OK);
  found.GetProfile(WTEXT("where"), &where, SString());
  EXPECT_EQ(where, SString(WTEXT("machine")));
  EXPECT_EQ(machine.DeleteKey(SString(), 1), S_OK);
}

TEST_F(Registry, TruthValues) {
  EXPECT_EQ(m_key.WriteProfile(WTEXT("yes"), 5), S_OK);
  EXPECT_EQ(m_key.WriteProfile(WTEXT("no"), 0), S_OK);
  EXPECT_EQ(Text(WTEXT("yes")), SString::Yes);
  EXPECT_EQ(Text(WTEXT("no")), SString::No);
  EXPECT_EQ(Truth(WTEXT("yes")), 1);
  EXPECT_EQ(Truth(WTEXT("no"), 1), 0);
  EXPECT_EQ(Number(WTEXT("yes")), 1);
  EXPECT_EQ(Number(WTEXT("no")), 0);
  PutText(WTEXT("true"), WTEXT("TRUE\r\n"));
  PutText(WTEXT("one"), WTEXT("\t 1 "));
  PutText(WTEXT("two"), WTEXT("2"));
  PutText(WTEXT("abc"), WTEXT("abc"));
  EXPECT_EQ(Truth(WTEXT("true")), 1);
  EXPECT_EQ(Truth(WTEXT("one")), 1);
  EXPECT_EQ(Truth(WTEXT("two"), 1), 0);
  EXPECT_EQ(Number(WTEXT("two")), 2);
  EXPECT_EQ(Number(WTEXT("abc")), 0);
  EXPECT_EQ(Truth(WTEXT("none"), 1), 1);
  EXPECT_EQ(Truth(WTEXT("none"), 0), 0);
  Put(WTEXT("binary"), REG_BINARY, "abc");
  int truth = -7;
  EXPECT_EQ(m_key.GetProfile(WTEXT("binary"), &truth, 5), E_FAIL);
  EXPECT_EQ(truth, 5);
}

TEST_F(Registry, Numbers) {
  unsigned long type = 0;
  long number = 0;
  EXPECT_EQ(m_key.WriteProfile(WTEXT("number"), -5L, 1), S_OK);
  EXPECT_EQ(m_key.GetProfile(WTEXT("number"), &number, 3, &type), S_OK);
  EXPECT_EQ(number, -5);
  EXPECT_EQ(type, static_cast<unsigned long>(REG_DWORD));
  EXPECT_EQ(Text(WTEXT("number")), SString(WTEXT("-5")));
  EXPECT_EQ(m_key.WriteProfile(WTEXT("digits"), -123456789L, 0), S_OK);
  EXPECT_EQ(m_key.GetProfile(WTEXT("digits"), &number, 3, &type), S_OK);
  EXPECT_EQ(number, -123456789);
  EXPECT_EQ(type, static_cast<unsigned long>(REG_SZ));
  Put(WTEXT("big"), REG_DWORD_BIG_ENDIAN, std::string("\x01\x02\x03\x04", 4));
  EXPECT_EQ(Number(WTEXT("big")), 0x01020304);
  Put(WTEXT("big"), REG_DWORD_BIG_ENDIAN, std::string("\xFF\xFF\xFF\xFE", 4));
  EXPECT_EQ(Text(WTEXT("big")), SString(WTEXT("-2")));
  PutText(WTEXT("text"), WTEXT(" +17 apples"));
  EXPECT_EQ(Number(WTEXT("text")), 17);
  PutText(WTEXT("text"), WTEXT("99999999999"));
  EXPECT_EQ(Number(WTEXT("text")), 2147483647);
  EXPECT_EQ(m_key.GetProfile(WTEXT("none"), &number, 42), kMissing);
  EXPECT_EQ(number, 42);
  Put(WTEXT("short"), REG_DWORD, "abc");
  EXPECT_EQ(m_key.GetProfile(WTEXT("short"), &number, 42, &type), E_FAIL);
  EXPECT_EQ(number, 42);
  EXPECT_EQ(type, static_cast<unsigned long>(REG_DWORD));
}

TEST_F(Registry, Texts) {
  const SString long1(WideString(5000, 0xE9).c_str());
  for (const SString& text : {SString(WTEXT("plain")), SString(), SString(WTEXT("\xD83D\xDE00\x4E2D\r\n")), long1}) {
    EXPECT_EQ(m_key.WriteProfile(WTEXT("text"), text), S_OK);
    EXPECT_EQ(Text(WTEXT("text")), text);
    // Half a terminator is written; Windows completes it.
    DWORD size = 0;
    EXPECT_EQ(RegQueryValueExW(m_key.GetKey(), WTEXT("text"), nullptr, nullptr, nullptr, &size), 0);
    EXPECT_TRUE(IsWindows() || size == static_cast<DWORD>(text.Length() * 2 + 1)) << size;
  }
  Put(WTEXT("open"), REG_SZ, std::string(reinterpret_cast<const char*>(WTEXT("abc")), 6));  // no terminator
  EXPECT_EQ(Text(WTEXT("open")), SString(WTEXT("abc")));
  Put(WTEXT("two"), REG_SZ, std::string(reinterpret_cast<const char*>(WTEXT("ab\0cd")), 12));
  EXPECT_EQ(Text(WTEXT("two")), SString(WTEXT("ab")));
  SString same(WTEXT("its own default"));
  EXPECT_EQ(m_key.GetProfile(WTEXT("none"), &same, same), kMissing);
  EXPECT_EQ(same, SString(WTEXT("its own default")));
  Put(WTEXT("list"), REG_MULTI_SZ, std::string(8, '\0'));
  EXPECT_EQ(m_key.GetProfile(WTEXT("list"), &same, SString(WTEXT("d"))), E_FAIL);
  EXPECT_EQ(same, SString(WTEXT("d")));
}

TEST_F(Registry, UnnamedValueFailsWhenEmpty) {
  SString text;
  EXPECT_EQ(m_key.GetProfile(SString(), &text, SString(WTEXT("d"))), kMissing);
  m_key.WriteProfile(SString(), SString(WTEXT("unnamed")));
  EXPECT_EQ(m_key.GetProfile(SString(), &text, SString()), S_OK);
  EXPECT_EQ(text, SString(WTEXT("unnamed")));
  m_key.WriteProfile(SString(), SString());
  EXPECT_EQ(m_key.GetProfile(SString(), &text, SString(WTEXT("d"))), E_FAIL);
  EXPECT_EQ(text, SString(WTEXT("d")));
}

TEST_F(Registry, ExpandableTexts) {
  const std::string large(1000, 'v');
  test::SetVariable("QXCORE_LARGE", large);
  PutText(WTEXT("path"), WTEXT("<%QXCORE_LARGE%>%QXCORE_NONE%"), REG_EXPAND_SZ);
  unsigned long type = 0;
  SString text;
  EXPECT_EQ(m_key.GetProfile(WTEXT("path"), &text, SString(), &type), S_OK);
  EXPECT_EQ(text, SString(("<" + large + ">%QXCORE_NONE%").c_str()));
  EXPECT_EQ(type, static_cast<unsigned long>(REG_EXPAND_SZ));
  test::SetVariable("QXCORE_LARGE", "");
}

TEST_F(Registry, BinaryValuesInGlobalMemory) {
  SHGlobal block;
  block.Alloc(0, 300);
  std::memset(block.Lock(), 0xAB, 300);
  block.Unlock();
  block.ReAlloc(5000, GMEM_MOVEABLE | GMEM_ZEROINIT);
  EXPECT_GE(block.Size(), 5000u);
  const auto* bytes = static_cast<const unsigned char*>(block.Lock());
  EXPECT_EQ(std::count(bytes, bytes + 300, 0xAB), 300);
  EXPECT_EQ(std::count(bytes + 300, bytes + 5000, 0), 4700);
  block.Unlock();
  block.ReAlloc(300, GMEM_MOVEABLE);
  EXPECT_EQ(m_key.WriteProfile(WTEXT("binary"), block, 100ul), S_OK);
  EXPECT_EQ(m_key.WriteProfile(WTEXT("binary"), block, 0ul), E_INVALIDARG);
  EXPECT_EQ(m_key.WriteProfile(WTEXT("binary"), static_cast<void*>(nullptr), 5ul), E_INVALIDARG);
  void* read = nullptr;
  unsigned long size = 0;
  EXPECT_EQ(m_key.GetProfile(WTEXT("binary"), &read, &size), S_OK);
  EXPECT_EQ(size, 100u);
  SHGlobal result(read);
  EXPECT_EQ(std::string(static_cast<char*>(result.Lock()), 100), std::string(100, '\xAB'));
  result.Unlock();
  result.Free();
  // No more than the block has.
  EXPECT_EQ(m_key.WriteProfile(WTEXT("binary"), block, 100000ul), S_OK);
  EXPECT_EQ(m_key.GetProfile(WTEXT("binary"), &read, &size), S_OK);
  EXPECT_EQ(size, block.Size());
  SHGlobal(read).Free();
  block.Free();
  EXPECT_EQ(m_key.GetProfile(WTEXT("none"), &read, &size), kMissing);
  EXPECT_EQ(read, nullptr);
  EXPECT_EQ(size, 0u);
  PutText(WTEXT("text"), WTEXT("abc"));
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), &read, &size), kMissing);
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), static_cast<void**>(nullptr), &size), E_POINTER);
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), &read, static_cast<unsigned long*>(nullptr)), E_POINTER);
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), static_cast<SString*>(nullptr), SString()), E_POINTER);
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), static_cast<long*>(nullptr), 1), E_POINTER);
  EXPECT_EQ(m_key.GetProfile(WTEXT("text"), static_cast<int*>(nullptr), 1), E_POINTER);
}

TEST_F(Registry, WithoutAnOpenKey) {
  SRegistry closed;
  SString text;
  int truth;
  long number;
  void* block;
  unsigned long size;
  EXPECT_EQ(closed.WriteProfile(WTEXT("x"), 1), S_OK);
  EXPECT_EQ(closed.WriteProfile(WTEXT("x"), 1L, 1), S_OK);
  EXPECT_EQ(closed.WriteProfile(WTEXT("x"), SString(WTEXT("y"))), S_OK);
  EXPECT_EQ(closed.WriteProfile(WTEXT("x"), static_cast<void*>(nullptr), 1ul), S_OK);
  EXPECT_EQ(closed.DeleteProfile(WTEXT("x"), 1), S_OK);
  EXPECT_EQ(closed.DeleteKey(WTEXT("x"), 1), S_OK);
  EXPECT_EQ(closed.GetProfile(WTEXT("x"), &text, SString(WTEXT("d"))), kMissing);
  EXPECT_EQ(text, SString(WTEXT("d")));
  EXPECT_EQ(closed.GetProfile(WTEXT("x"), &truth, 1), kMissing);
  EXPECT_EQ(truth, 1);
  EXPECT_EQ(closed.GetProfile(WTEXT("x"), &number, 9), kMissing);
  EXPECT_EQ(number, 9);
  EXPECT_EQ(closed.GetProfile(WTEXT("x"), &block, &size), kMissing);
  EXPECT_NE(closed.GetEnumKey(0, &text), 0);
  EXPECT_NE(closed.GetEnumValue(0, &text), 0);
  EXPECT_TRUE(text.IsEmpty());
}

TEST_F(Registry, Enumeration) {
  for (const WCHAR* name : {WTEXT("gamma"), WTEXT("Alpha"), WTEXT("beta")}) {
    SRegistry sub(m_key.GetKey(), name, 1);
    ASSERT_TRUE(sub.IsOpen());
  }
  const WideString longName(255, 'z');
  if (!IsWine()) SRegistry(m_key.GetKey(), longName.c_str(), 1);
  SString name, className, value;
  SString all;
  long index = 0;
  for (; m_key.GetEnumKey(index, &name, &className) == 0; ++index) all += name + WTEXT(",");
  EXPECT_EQ(m_key.GetEnumKey(index, &name), static_cast<long>(ERROR_NO_MORE_ITEMS));
  EXPECT_TRUE(name.IsEmpty());
  EXPECT_EQ(all, SString(WTEXT("Alpha,beta,gamma,")) + (IsWine() ? SString() : SString(longName.c_str()) + WTEXT(",")));

  Put(WTEXT("a"), REG_DWORD, std::string("\xFE\xFF\xFF\xFF", 4));
  const SString longText(WideString(3000, 'x').c_str());
  m_key.WriteProfile(WTEXT("b"), longText);
  PutText(WTEXT("c"), WTEXT("%QXCORE_X%"), REG_EXPAND_SZ);
  unsigned long type = 0;
  EXPECT_EQ(m_key.GetEnumValue(0, &name, &value, &type), 0);
  EXPECT_EQ(name, SString(WTEXT("a")));
  EXPECT_EQ(value, SString(WTEXT("4294967294")));
  EXPECT_EQ(type, static_cast<unsigned long>(REG_DWORD));
  EXPECT_EQ(m_key.GetEnumValue(1, &name, &value, &type), 0);
  EXPECT_EQ(value, longText);
  EXPECT_EQ(m_key.GetEnumValue(2, &name, &value), 0);
  EXPECT_EQ(value, SString(WTEXT("%QXCORE_X%")));  // as it stands
  type = 0;
  EXPECT_EQ(m_key.GetEnumValue(1, &name, nullptr, &type), 0);
  EXPECT_EQ(type, static_cast<unsigned long>(REG_SZ));
  EXPECT_EQ(m_key.GetEnumValue(1, nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(m_key.GetEnumValue(3, &name, &value, &type), static_cast<long>(ERROR_NO_MORE_ITEMS));
  EXPECT_TRUE(name.IsEmpty());
  EXPECT_TRUE(value.IsEmpty());
  m_key.WriteProfile(WideString(256, 'z').c_str(), 1);
  EXPECT_EQ(m_key.GetEnumValue(3, &name, &value), static_cast<long>(ERROR_MORE_DATA));
}

// Others make a value longer between the look at its size and the reading of it.
TEST_F(Registry, AValueThatGrowsMeanwhileIsRead) {
  m_key.WriteProfile(WTEXT("v"), SString(WTEXT("x")));
  const HKEY key = m_key.GetKey();
  std::atomic<bool> isDone{false};
  std::thread writer([&] {
    const WideString text(4000, 'x');
    for (DWORD length = 300; !isDone; length = length < 4000 ? length + 100 : 300)
      RegSetValueExW(key, WTEXT("v"), 0, REG_SZ, reinterpret_cast<const BYTE*>(text.data()), length * sizeof(WCHAR));
  });
  SString value;
  int failures = 0;
  for (int i = 0; i < 4000; ++i) failures += m_key.GetEnumValue(0, nullptr, &value) != 0;
  isDone = true;
  writer.join();
  EXPECT_EQ(failures, 0);
}

TEST_F(Registry, DeletionOfTrees) {
  for (const WCHAR* path : {WTEXT("tree\\a\\b"), WTEXT("tree\\a\\c\\d"), WTEXT("tree\\e"), WTEXT("leaf")})
    SRegistry(m_key.GetKey(), path, 1).WriteProfile(WTEXT("x"), 1);
  m_key.WriteProfile(WTEXT("leaf"), 1);
  EXPECT_EQ(m_key.DeleteProfile(WTEXT("leaf"), 0), S_OK);  // the value
  EXPECT_EQ(Text(WTEXT("leaf")), SString(WTEXT("default")));
  EXPECT_TRUE(SRegistry(m_key.GetKey(), WTEXT("leaf"), 0).IsOpen());
  EXPECT_EQ(m_key.DeleteProfile(WTEXT("leaf"), 0), S_OK);  // the key
  EXPECT_FALSE(SRegistry(m_key.GetKey(), WTEXT("leaf"), 0).IsOpen());
  EXPECT_EQ(m_key.DeleteProfile(WTEXT("leaf"), 0), S_OK);  // nothing
  EXPECT_EQ(m_key.DeleteKey(WTEXT("no\\such"), 1), S_OK);
  EXPECT_EQ(m_key.DeleteKey(WTEXT("tree"), 0), E_FAIL);
  EXPECT_EQ(m_key.DeleteKey(WTEXT("tree"), 1), S_OK);
  EXPECT_FALSE(SRegistry(m_key.GetKey(), WTEXT("tree"), 0).IsOpen());
  SRegistry sub(m_key.GetKey(), WTEXT("other\\sub"), 1);
  EXPECT_EQ(m_key.DeleteKey(SString(), 1), S_OK);  // the key itself
  EXPECT_FALSE(SRegistry(HKEY_CURRENT_USER, RegistryRoot::Path(), 0).IsOpen());
  EXPECT_EQ(sub.WriteProfile(WTEXT("x"), 1), E_FAIL);
  EXPECT_EQ(sub.WriteProfile(WTEXT("x"), 1L, 1), E_FAIL);
  SString text;
  EXPECT_EQ(sub.GetProfile(WTEXT("x"), &text, SString(WTEXT("d"))), E_FAIL);
  EXPECT_EQ(text, SString(WTEXT("d")));
}

#ifndef _WIN32
TEST_F(Registry, AFullDiskIsToldAndLosesNothing) {
  m_key.WriteProfile(WTEXT("before"), SString(WTEXT("kept")));
  const SString large(WideString(500000, 'x').c_str());
  HRESULT result;
  {
    const test::FileSizeLimit limit(200000);
    result = m_key.WriteProfile(WTEXT("large"), large);
  }
  EXPECT_EQ(result, E_FAIL);
  EXPECT_EQ(Text(WTEXT("before")), SString(WTEXT("kept")));
  EXPECT_EQ(Text(WTEXT("large")), SString(WTEXT("default")));
  EXPECT_EQ(m_key.WriteProfile(WTEXT("large"), large), S_OK);
  EXPECT_EQ(Text(WTEXT("large")), large);
}

// A key that cannot be deleted: the database refuses. The others go all the same.
TEST_F(Registry, DeletionGoesOnPastAKeyThatStays) {
  for (const WCHAR* path : {WTEXT("tree\\a\\x"), WTEXT("tree\\keep\\y"), WTEXT("tree\\z")})
    SRegistry(m_key.GetKey(), path, 1).WriteProfile(WTEXT("v"), 1);
  sqlite3* database = nullptr;
  ASSERT_EQ(sqlite3_open(m_root.File().c_str(), &database), SQLITE_OK);
  ASSERT_EQ(sqlite3_exec(database,
                         "CREATE TRIGGER keeps BEFORE DELETE ON keys WHEN old.name = x'6B00650065007000'"
                         " BEGIN SELECT RAISE(ABORT, 'kept'); END",
                         nullptr, nullptr, nullptr),
            SQLITE_OK);
  EXPECT_EQ(m_key.DeleteKey(WTEXT("tree"), 1), E_FAIL);
  SRegistry tree(m_key.GetKey(), WTEXT("tree"), 0);
  SString name;
  EXPECT_EQ(tree.GetEnumKey(0, &name), 0);
  EXPECT_EQ(name, SString(WTEXT("keep")));
  EXPECT_EQ(tree.GetEnumKey(1, &name), static_cast<long>(ERROR_NO_MORE_ITEMS));
  SRegistry kept(tree.GetKey(), WTEXT("keep"), 0);
  EXPECT_NE(kept.GetEnumKey(0, &name), 0);  // what is below it is gone
  // A name that no path can reach comes again and again.
  sqlite3_exec(database, "DROP TRIGGER keeps; UPDATE keys SET name = x'61005C006200' WHERE name = x'6B00650065007000'",
               nullptr, nullptr, nullptr);
  EXPECT_EQ(m_key.DeleteKey(WTEXT("tree"), 1), E_FAIL);
  sqlite3_exec(database, "UPDATE keys SET name = x'6B00650065007000' WHERE name = x'61005C006200'", nullptr, nullptr,
               nullptr);
  sqlite3_close(database);
  EXPECT_EQ(m_key.DeleteKey(WTEXT("tree"), 1), S_OK);
}
#endif

TEST_F(Registry, EachAllocationFailing) {
  const SString longText(WideString(3000, 'x').c_str());
  m_key.WriteProfile(WTEXT("text"), longText);
  PutText(WTEXT("path"), (WideString(600, 'x') + WTEXT("%PATH%")).c_str(), REG_EXPAND_SZ);
  Put(WTEXT("binary"), REG_BINARY, std::string(3000, 'b'));
  SString text(WTEXT("kept"));
  const int failures = WithEachAllocationFailing(
      [&] {
        m_key.WriteProfile(WTEXT("text"), longText);
        m_key.GetProfile(WTEXT("text"), &text, SString());
        m_key.GetProfile(WTEXT("path"), &text, SString());
        m_key.GetEnumValue(0, nullptr, &text);
        void* block = nullptr;
        unsigned long size;
        m_key.GetProfile(WTEXT("binary"), &block, &size);
        SHGlobal(block).Free();
        text = WTEXT("kept");
      },
      [&] { EXPECT_EQ(Text(WTEXT("text")), longText); });
  EXPECT_GT(failures, 5);
}

TEST_F(Registry, ApplicationKeyIsAText) {
  EXPECT_EQ(SRegistry::GetApplicationPath(WTEXT("Paths")), SString(WTEXT("Software\\Quorix\\Stratomodeler 11\\Paths")));
}

}  // namespace
