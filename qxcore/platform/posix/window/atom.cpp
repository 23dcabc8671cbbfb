#include "qxcore/platform/posix/window/atom.h"

#include <unordered_map>

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/window/handle_table.h"

namespace platform::model {
namespace {

constexpr ATOM kFirstName = 0xC000;
constexpr std::size_t kMostNames = 0x4000;

struct FoldedHash {
  std::size_t operator()(SStringView text) const {
    std::size_t hash = 14695981039346656037u;
    for (const WCHAR c : text) hash = (hash ^ ToUpperBmp(c)) * 1099511628211u;
    return hash;
  }
};

struct FoldedEqual {
  bool operator()(SStringView a, SStringView b) const {
    if (a.size() != b.size()) return false;
    for (std::size_t i = 0; i < a.size(); ++i)
      if (a[i] != b[i] && ToUpperBmp(a[i]) != ToUpperBmp(b[i])) return false;
    return true;
  }
};

struct Names {
  std::unordered_map<SStringView, ATOM, FoldedHash, FoldedEqual, Allocator<std::pair<const SStringView, ATOM>>> atoms;
  List<Text*> texts;  // by atom; never freed, because the map's views lead into them
};

Names& TheNames() {
  static Names* names = new Names;
  return *names;
}

// The number that a name stands for by itself; 0 otherwise.
ATOM NumberOf(LPCWSTR name) {
  if (reinterpret_cast<std::uintptr_t>(name) <= 0xFFFF)
    return static_cast<ATOM>(reinterpret_cast<std::uintptr_t>(name));
  if (name[0] != '#') return 0;
  unsigned int number = 0;
  for (LPCWSTR c = name + 1; *c != 0; ++c) {
    if (*c < '0' || *c > '9' || number > 0xFFFF) return 0;
    number = number * 10 + (*c - '0');
  }
  return number < kFirstName ? static_cast<ATOM>(number) : 0;
}

}  // namespace

ATOM FindName(LPCWSTR name) {
  if (name == nullptr) return 0;
  if (const ATOM number = NumberOf(name)) return number;
  const Names& names = TheNames();
  const auto found = names.atoms.find(SStringView(name));
  return found != names.atoms.end() ? found->second : 0;
}

ATOM InternName(LPCWSTR name) {
  if (const ATOM known = FindName(name)) return known;
  if (name == nullptr || *name == 0) return 0;
  Names& names = TheNames();
  if (names.texts.size() >= kMostNames) throw std::bad_alloc();
  names.texts.reserve(names.texts.size() + 1);
  struct Held : Text, OnModelHeap {
    using Text::Text;
  };
  Held* text = new Held(name);
  try {
    const ATOM atom = static_cast<ATOM>(kFirstName + names.texts.size());
    names.atoms.emplace(SStringView(*text), atom);
    names.texts.push_back(text);
    return atom;
  } catch (...) {
    delete text;
    throw;
  }
}

SStringView NameOf(ATOM atom, NumberText& digits) {
  const Names& names = TheNames();
  if (atom >= kFirstName) {
    const std::size_t index = atom - kFirstName;
    return index < names.texts.size() ? SStringView(*names.texts[index]) : SStringView();
  }
  WCHAR* first = std::end(digits);
  for (unsigned int rest = atom; rest != 0; rest /= 10) *--first = static_cast<WCHAR>('0' + rest % 10);
  *--first = '#';
  return SStringView(first, std::end(digits));
}

}  // namespace platform::model

UINT RegisterWindowMessageW(LPCWSTR name) {
  using namespace platform::model;
  if (name == nullptr || *name == 0) return Fail<UINT>(ERROR_INVALID_PARAMETER);
  return OrNoMemory<UINT>(0, [&] {
    const Guard guard;
    return InternName(name);
  });
}
