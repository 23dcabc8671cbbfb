// The registry's functions: codes, sizes, rights, enumeration, deleted keys; on Linux the database below
// them: several processes, killed writers, files that nobody may write.

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "qxcore/platform/wide.h"
#include "qxcore/platform/win32.h"
#include "tests/support/registry_root.h"
#include "tests/support/text.h"

namespace {

using test::RegistryRoot;

LSTATUS Code(DWORD code) { return static_cast<LSTATUS>(code); }

class Key {
 public:
  Key() = default;
  Key(HKEY root, const WCHAR* path, REGSAM access = KEY_ALL_ACCESS) { result = Open(root, path, access); }
  Key(const Key&) = delete;
  Key& operator=(const Key&) = delete;
  ~Key() {
    if (handle != nullptr) RegCloseKey(handle);
  }
  LSTATUS Open(HKEY root, const WCHAR* path, REGSAM access) { return RegOpenKeyExW(root, path, 0, access, &handle); }
  LSTATUS Create(HKEY root, const WCHAR* path, REGSAM access = KEY_ALL_ACCESS) {
    return RegCreateKeyExW(root, path, 0, nullptr, 0, access, nullptr, &handle, &disposition);
  }
  operator HKEY() const { return handle; }

  HKEY handle = nullptr;
  DWORD disposition = 0;
  LSTATUS result = 0;
};

LSTATUS Set(HKEY key, const WCHAR* name, DWORD type, const std::string& bytes) {
  return RegSetValueExW(key, name, 0, type, reinterpret_cast<const BYTE*>(bytes.data()),
                        static_cast<DWORD>(bytes.size()));
}

std::string Get(HKEY key, const WCHAR* name, DWORD* type = nullptr) {
  BYTE bytes[4096];
  DWORD size = sizeof bytes;
  const LSTATUS result = RegQueryValueExW(key, name, nullptr, type, bytes, &size);
  return result == 0 ? std::string(reinterpret_cast<char*>(bytes), size) : "error " + std::to_string(result);
}

std::vector<WideString> SubKeys(HKEY key) {
  std::vector<WideString> names;
  WCHAR name[256];
  for (DWORD length = 256;
       RegEnumKeyExW(key, static_cast<DWORD>(names.size()), name, &length, nullptr, nullptr, nullptr, nullptr) == 0;
       length = 256)
    names.emplace_back(name, length);
  return names;
}

std::vector<WideString> Values(HKEY key) {
  std::vector<WideString> names;
  WCHAR name[256];
  for (DWORD length = 256;
       RegEnumValueW(key, static_cast<DWORD>(names.size()), name, &length, nullptr, nullptr, nullptr, nullptr) == 0;
       length = 256)
    names.emplace_back(name, length);
  return names;
}

TEST(Registry, KeysAreFoundWithoutCase) {
  const RegistryRoot root;
  Key made, again, below;
  EXPECT_EQ(made.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  EXPECT_EQ(made.disposition, static_cast<DWORD>(REG_CREATED_NEW_KEY));
  EXPECT_EQ(again.Create(HKEY_CURRENT_USER, WTEXT("SOFTWARE\\QXCORE TEST\\")), 0);
  EXPECT_EQ(again.disposition, static_cast<DWORD>(REG_OPENED_EXISTING_KEY));
  EXPECT_EQ(below.Create(made, WTEXT("Stra\xDF"
                                     "e\\\xC4 b\\c")),
            0);
  EXPECT_EQ(Key(made, WTEXT("stra\xDF"
                            "e\\\xE4 B\\C"))
                .result,
            0);
  EXPECT_EQ(Key(made, WTEXT("")).result, 0);
  EXPECT_EQ(Key(made, nullptr).result, 0);
  EXPECT_EQ(Key(made, WTEXT("strasse")).result, Code(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(Key(made, WTEXT("\\c")).result, Code(ERROR_BAD_PATHNAME));
  EXPECT_EQ(Key(reinterpret_cast<HKEY>(0x1234567), WTEXT("a")).result, Code(ERROR_INVALID_HANDLE));
  EXPECT_EQ(Key(nullptr, WTEXT("a")).result, Code(ERROR_INVALID_HANDLE));
  HKEY closed = nullptr;
  ASSERT_EQ(RegOpenKeyExW(made, WTEXT(""), 0, KEY_READ, &closed), 0);
  EXPECT_EQ(RegCloseKey(closed), 0);
  EXPECT_EQ(RegCloseKey(closed), Code(ERROR_INVALID_HANDLE));
  EXPECT_EQ(Get(closed, WTEXT("x")), "error 6");
  if (!IsWine()) {
    const WideString longest(255, 'k'), tooLong(256, 'k');
    EXPECT_EQ(Key().Create(made, longest.c_str()), 0);
    EXPECT_NE(Key().Create(made, tooLong.c_str()), 0);
  }
}

TEST(Registry, ValuesKeepTypeAndBytes) {
  const RegistryRoot root;
  Key key;
  ASSERT_EQ(key.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  DWORD type = 99;
  EXPECT_EQ(Set(key, WTEXT("Binary"), REG_BINARY, std::string("\0\1\2", 3)), 0);
  EXPECT_EQ(Get(key, WTEXT("bINARY"), &type), std::string("\0\1\2", 3));
  EXPECT_EQ(type, static_cast<DWORD>(REG_BINARY));
  EXPECT_EQ(Set(key, WTEXT("binary"), REG_DWORD, "four"), 0);  // another type, the same value
  EXPECT_EQ(Get(key, WTEXT("Binary"), &type), "four");
  EXPECT_EQ(type, static_cast<DWORD>(REG_DWORD));
  EXPECT_EQ(Set(key, WTEXT("odd"), REG_SZ, std::string("a\0b\0\0", 5)), 0);
  EXPECT_EQ(Get(key, WTEXT("odd")).substr(0, 5), std::string("a\0b\0\0", 5));
  EXPECT_EQ(Set(key, nullptr, 77, "unnamed"), 0);
  EXPECT_EQ(Get(key, WTEXT(""), &type), "unnamed");
  EXPECT_EQ(type, 77u);
  EXPECT_EQ(Set(key, WTEXT("empty"), REG_BINARY, ""), 0);
  EXPECT_EQ(Get(key, WTEXT("empty")), "");
  EXPECT_EQ(Get(key, WTEXT("none")), "error 2");

  BYTE bytes[8] = {};
  DWORD size = 3;
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("binary"), nullptr, &type, bytes, &size), Code(ERROR_MORE_DATA));
  EXPECT_EQ(size, 4u);
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("binary"), nullptr, &type, nullptr, &size), 0);
  EXPECT_EQ(size, 4u);
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("binary"), nullptr, nullptr, bytes, nullptr), Code(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("binary"), nullptr, nullptr, nullptr, nullptr), 0);

  const std::string large(3000000, 'x');
  EXPECT_EQ(Set(key, WTEXT("large"), REG_BINARY, large), 0);
  std::string read(large.size(), 0);
  size = static_cast<DWORD>(read.size());
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("large"), nullptr, nullptr, reinterpret_cast<BYTE*>(read.data()), &size), 0);
  EXPECT_EQ(read, large);
  const WideString longest(16383, 'v');
  EXPECT_EQ(Set(key, longest.c_str(), REG_SZ, "ab"), 0);
  EXPECT_EQ(Set(key, (longest + WTEXT("v")).c_str(), REG_SZ, "ab"), Code(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(RegDeleteValueW(key, longest.c_str()), 0);
  EXPECT_EQ(RegDeleteValueW(key, longest.c_str()), Code(ERROR_FILE_NOT_FOUND));
}

TEST(Registry, EnumerationAndCounts) {
  const RegistryRoot root;
  Key key;
  ASSERT_EQ(key.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  std::vector<WideString> names;
  for (int i = 299; i >= 0; --i) {
    WCHAR name[16];
    platform::WideFormat(name, 16, i % 2 == 0 ? WTEXT("key %03d") : WTEXT("KEY %03d"), i);
    names.insert(names.begin(), name);
    ASSERT_EQ(Key().Create(key, name), 0);
    ASSERT_EQ(Set(key, name, REG_SZ, "abcd"), 0);
  }
  EXPECT_EQ(SubKeys(key), names);
  std::vector<WideString> values = Values(key);
  if (!IsWindows()) std::reverse(values.begin(), values.end());  // the order in which they were made
  EXPECT_EQ(values, names);
  // Changes between two steps move what follows.
  WCHAR name[256];
  DWORD length = 256;
  EXPECT_EQ(RegDeleteKeyW(key, WTEXT("key 000")), 0);
  EXPECT_EQ(RegEnumKeyExW(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(WideString(name), names[1]);
  length = 7;
  EXPECT_EQ(RegEnumKeyExW(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), Code(ERROR_MORE_DATA));
  length = 7;
  EXPECT_EQ(RegEnumValueW(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), Code(ERROR_MORE_DATA));
  length = 256;
  EXPECT_EQ(RegEnumKeyExW(key, 299, name, &length, nullptr, nullptr, nullptr, nullptr), Code(ERROR_NO_MORE_ITEMS));
  EXPECT_EQ(RegEnumValueW(key, 300, name, &length, nullptr, nullptr, nullptr, nullptr), Code(ERROR_NO_MORE_ITEMS));
}

TEST(Registry, RightsOfTheHandle) {
  const RegistryRoot root;
  Key key;
  ASSERT_EQ(key.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  const Key reader(key, WTEXT(""), KEY_READ), writer(key, WTEXT(""), KEY_WRITE);
  EXPECT_EQ(Set(reader, WTEXT("x"), REG_SZ, ""), Code(ERROR_ACCESS_DENIED));
  EXPECT_EQ(RegDeleteValueW(reader, WTEXT("x")), Code(ERROR_ACCESS_DENIED));
  EXPECT_EQ(Set(writer, WTEXT("x"), REG_SZ, "ab"), 0);
  EXPECT_EQ(Get(writer, WTEXT("x")), "error 5");
  EXPECT_EQ(Get(reader, WTEXT("x")).substr(0, 2), "ab");
  WCHAR name[8];
  DWORD length = 8;
  EXPECT_EQ(RegEnumKeyExW(writer, 0, name, &length, nullptr, nullptr, nullptr, nullptr), Code(ERROR_ACCESS_DENIED));
}

TEST(Registry, DeletedKeysAnswerSo) {
  const RegistryRoot root;
  Key key, child, deep;
  ASSERT_EQ(key.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  ASSERT_EQ(deep.Create(key, WTEXT("child\\deep")), 0);
  ASSERT_EQ(child.Open(key, WTEXT("child"), KEY_ALL_ACCESS), 0);
  EXPECT_EQ(RegDeleteKeyW(key, WTEXT("child")), Code(ERROR_ACCESS_DENIED));
  EXPECT_EQ(RegDeleteKeyW(key, WTEXT("none")), Code(ERROR_FILE_NOT_FOUND));
  ASSERT_EQ(Set(deep, WTEXT("x"), REG_SZ, "ab"), 0);
  EXPECT_EQ(RegDeleteKeyW(key, WTEXT("child\\deep")), 0);
  EXPECT_EQ(Get(deep, WTEXT("x")), "error 1018");
  EXPECT_EQ(Set(deep, WTEXT("x"), REG_SZ, ""), Code(ERROR_KEY_DELETED));
  EXPECT_EQ(Key(deep, WTEXT("")).result, Code(ERROR_KEY_DELETED));
  EXPECT_EQ(Key().Create(deep, WTEXT("new")), Code(ERROR_KEY_DELETED));
  // A new key of the name is another key, and empty.
  Key again;
  ASSERT_EQ(again.Create(child, WTEXT("deep")), 0);
  EXPECT_EQ(Get(again, WTEXT("x")), "error 2");
  EXPECT_EQ(Get(deep, WTEXT("x")), "error 1018");
  EXPECT_EQ(RegDeleteKeyW(again, WTEXT("")), 0);
  EXPECT_TRUE(SubKeys(child).empty());
}

TEST(Registry, ThreadsShareIt) {
  const RegistryRoot root;
  Key key;
  ASSERT_EQ(key.Create(HKEY_CURRENT_USER, RegistryRoot::Path()), 0);
  std::atomic<int> wrong = 0;
  std::vector<std::thread> threads;
  for (int id = 0; id < 4; ++id) {
    threads.emplace_back([&, id] {
      const WCHAR own[] = {static_cast<WCHAR>('a' + id), 0};
      for (int i = 0; i < 200; ++i) {
        const std::string text = std::to_string(i);
        Key sub;
        wrong += sub.Create(key, own) != 0 || Set(sub, own, REG_BINARY, text) != 0 || Get(sub, own) != text;
        if (i % 50 == 0) wrong += RegDeleteKeyW(key, own) != 0 || Get(sub, own) != "error 1018";
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0);
}

TEST(Environment, ReferencesAreExpanded) {
  const auto expand = [](const WCHAR* text) {
    WCHAR expanded[256];
    const DWORD count = ExpandEnvironmentStringsW(text, expanded, 256);
    EXPECT_EQ(count, platform::WideLength(expanded) + 1);
    return WideString(expanded);
  };
  test::SetVariable("QXCORE_One", "1: a\\b/c");
  EXPECT_EQ(expand(WTEXT("<%QXCORE_One%>")), WTEXT("<1: a\\b/c>"));
  EXPECT_EQ(expand(WTEXT("<%qxcore_ONE%%QXCORE_ONE%>")), WTEXT("<1: a\\b/c1: a\\b/c>"));
  EXPECT_EQ(expand(WTEXT("%QXCORE_NONE% 100% %%")), WTEXT("%QXCORE_NONE% 100% %%"));
  EXPECT_EQ(expand(WTEXT("")), WTEXT(""));
  // A name is the whole of it, and neither the beginning of another one nor another one and more.
  test::SetVariable("QXCORE_OneMore", "2");
  EXPECT_EQ(expand(WTEXT("%qxcore_onemore%%qxcore_one%")), WTEXT("21: a\\b/c"));
  const WideString name = WTEXT("qxcore_onemore");
  for (std::size_t length = 7; length < name.size() + 3; ++length) {
    if (length == 10 || length == name.size()) continue;  // that is one
    const WideString reference = WTEXT("%") + (name + WTEXT("xyz")).substr(0, length) + WTEXT("%");
    EXPECT_EQ(expand(reference.c_str()), reference);
  }
  test::SetVariable("QXCORE_OneMore", "");
  WCHAR small[4];
  EXPECT_GE(ExpandEnvironmentStringsW(WTEXT("%QXCORE_One%"), small, 4), 9u);
  test::SetVariable("QXCORE_One", "");
}

}  // namespace
