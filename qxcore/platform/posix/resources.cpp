// String resources: the library's own table is made by the compiler from the list of texts that the
// Windows resource compiler reads, too.

#include <algorithm>
#include <array>
#include <string_view>

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/module.h"
#include "qxcore/platform/posix/failure.h"
#include "qxcore/platform/resource_table.h"

namespace {

// The resource compiler's notation knows a doubled quotation mark inside a text, which C++ would read
// as two adjacent literals. So the preprocessor hands over the spelling, and it is read here.
struct Spelling {
  unsigned int id;
  std::string_view text;  // quotation marks and escapes included
};

#define S(id, text) Spelling{id, #text},
constexpr Spelling kSpellings[] = {
#if __has_include("qxcore/resources/strings.inc")
#include "qxcore/resources/strings.inc"
#endif
    {0xFFFFFFFF, "\"\""}};
#undef S
constexpr std::size_t kCount = std::size(kSpellings) - 1;

constexpr char Escaped(char letter) {
  switch (letter) {
    case 'n':
      return '\n';
    case 'r':
      return '\r';
    case 't':
      return '\t';
    case '0':
      return '\0';
    default:
      return letter;  // \\ and \"
  }
}

// Reads one spelling; hands each UTF-16 code unit to `put` and returns their number.
template <class Put>
constexpr std::size_t ReadText(std::string_view spelling, Put put) {
  std::size_t count = 0;
  auto emit = [&](char32_t c) {
    WCHAR units[2] = {};
    const WCHAR* end = platform::PutUtf16(c, units);
    for (const WCHAR* unit = units; unit != end; ++unit) put(count++, *unit);
  };
  for (std::size_t i = 1; i + 1 < spelling.size(); ++i) {
    const unsigned char c = static_cast<unsigned char>(spelling[i]);
    if (c == '"') {
      emit('"');
      ++i;  // its double
    } else if (c == '\\') {
      emit(static_cast<unsigned char>(Escaped(spelling[++i])));
    } else if (c < 0x80) {
      emit(c);
    } else {
      const int more = c >= 0xF0 ? 3 : c >= 0xE0 ? 2 : 1;
      char32_t value = c & (0x3F >> more);
      for (int k = 0; k < more; ++k) value = (value << 6) | (static_cast<unsigned char>(spelling[++i]) & 0x3F);
      emit(value);
    }
  }
  return count;
}

constexpr std::size_t PoolSize() {
  std::size_t size = 1;
  for (const Spelling& spelling : kSpellings) size += ReadText(spelling.text, [](std::size_t, WCHAR) {}) + 1;
  return size;
}

struct Pool {
  WCHAR text[PoolSize()];
  std::size_t start[kCount + 1];
  std::size_t length[kCount + 1];
};

constexpr Pool MakePool() {
  Pool pool{};
  std::size_t used = 0;
  for (std::size_t i = 0; i < kCount; ++i) {
    pool.start[i] = used;
    pool.length[i] = ReadText(kSpellings[i].text, [&](std::size_t at, WCHAR c) { pool.text[used + at] = c; });
    used += pool.length[i] + 1;
  }
  return pool;
}

constexpr Pool kPool = MakePool();

constexpr std::array<StringResource, kCount + 1> MakeTable() {
  std::array<StringResource, kCount + 1> table{};
  for (std::size_t i = 0; i < kCount; ++i) table[i] = {kSpellings[i].id, kPool.text + kPool.start[i], kPool.length[i]};
  std::sort(table.begin(), table.begin() + kCount, [](const auto& a, const auto& b) { return a.id < b.id; });
  return table;
}

constexpr std::array<StringResource, kCount + 1> kTable = MakeTable();

HINSTANCE__ g_library{kTable.data(), kCount};
HINSTANCE__ g_program{nullptr, 0};

const StringResource* FindText(HINSTANCE instance, unsigned int id) {
  const HINSTANCE module = instance != nullptr ? instance : &g_program;
  const StringResource* end = module->strings + module->count;
  const StringResource* found = std::lower_bound(
      module->strings, end, id, [](const StringResource& text, unsigned int wanted) { return text.id < wanted; });
  return found != end && found->id == id ? found : nullptr;
}

}  // namespace

namespace platform {

HINSTANCE ModuleHandle() noexcept { return &g_library; }

}  // namespace platform

HMODULE GetModuleHandleW(LPCWSTR name) {
  if (name == nullptr) return &g_program;
  return platform::FailWith<HMODULE>(ERROR_MOD_NOT_FOUND);
}

int LoadStringW(HINSTANCE instance, UINT id, LPWSTR buffer, int size) {
  if (buffer == nullptr || size < 0) return platform::FailWith<int>(ERROR_INVALID_PARAMETER);
  const StringResource* text = FindText(instance, id & 0xFFFF);
  if (text == nullptr) {
    if (size > 0) buffer[0] = 0;
    return platform::FailWith<int>(ERROR_RESOURCE_NAME_NOT_FOUND);
  }
  if (size == 0) {  // the caller wants the resource itself
    *reinterpret_cast<const WCHAR**>(buffer) = text->text;
    return static_cast<int>(text->length);
  }
  const std::size_t count = std::min(text->length, static_cast<std::size_t>(size - 1));
  std::copy_n(text->text, count, buffer);
  buffer[count] = 0;
  return static_cast<int>(count);
}

HRSRC FindResourceW(HMODULE module, LPCWSTR name, LPCWSTR type) {
  if (reinterpret_cast<std::uintptr_t>(type) != reinterpret_cast<std::uintptr_t>(RT_STRING)) {
    const platform::ResourceBytes found = platform::FindRegisteredResource(module, type, name);
    if (found.data == nullptr) return platform::FailWith<HRSRC>(ERROR_RESOURCE_TYPE_NOT_FOUND);
    return reinterpret_cast<HRSRC>(const_cast<void*>(found.data));
  }
  // A block holds the sixteen texts whose ids divided by sixteen, plus one, are its name.
  const auto block = reinterpret_cast<std::uintptr_t>(name);
  const HINSTANCE instance = module != nullptr ? module : &g_program;
  if (block > 0 && block <= 0xFFFF) {
    for (std::size_t i = 0; i < instance->count; ++i)
      if (instance->strings[i].id / 16 + 1 == block)
        return reinterpret_cast<HRSRC>(const_cast<StringResource*>(&instance->strings[i]));
  }
  return platform::FailWith<HRSRC>(ERROR_RESOURCE_NAME_NOT_FOUND);
}

// What was registered is in memory already: a resource, what it is loaded as and its bytes are one address.
DWORD SizeofResource(HMODULE, HRSRC resource) { return static_cast<DWORD>(platform::RegisteredResourceSize(resource)); }
HGLOBAL LoadResource(HMODULE, HRSRC resource) { return resource; }
LPVOID LockResource(HGLOBAL resource) { return resource; }
