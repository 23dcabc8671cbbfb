#include <iconv.h>
#include <unicode/uchar.h>
#include <unicode/ucnv.h>
#include <unicode/unorm2.h>

#include <algorithm>
#include <atomic>
#include <cstring>
#include <iterator>
#include <mutex>

#include "qxcore/platform/posix/code_page.h"

namespace platform {
namespace {

using namespace std::string_view_literals;

constexpr CodePageInfo kPages[] = {
#define PAGE(number, kind, converter, name, maxBytes, defaultByte, defaultChar, leadRanges) \
  {number, CodePageKind::kind, converter, name, maxBytes, defaultByte, defaultChar, leadRanges##sv},
#include "qxcore/platform/posix/code_page_list.inc"
#undef PAGE
};
static_assert(std::is_sorted(std::begin(kPages), std::end(kPages),
                             [](const auto& a, const auto& b) { return a.number < b.number; }));

struct Patch {
  std::uint16_t page, first, last, value, step;
  bool valid;
};

constexpr Patch kPatches[] = {
#define PATCH(page, first, last, value, step, valid) {page, first, last, value, step, valid},
#include "qxcore/platform/posix/code_page_patches.inc"
#undef PATCH
};

constexpr std::size_t kPageCount = std::size(kPages);
std::atomic<const DecodeTable*> g_decodeTables[kPageCount];
std::atomic<const EncodeTable*> g_encodeTables[kPageCount];
std::mutex g_making;

// The one converter that ICU lacks is the C library's.
bool IsFromIconv(const CodePageInfo& page) { return page.number == 1361; }

// A converter of either origin that stops at what it cannot convert.
class Converter {
 public:
  explicit Converter(const CodePageInfo& page) {
    if (IsFromIconv(page)) {
      m_iconv = iconv_open("UTF-16LE", page.converter);
      return;
    }
    UErrorCode error = U_ZERO_ERROR;
    m_icu = ucnv_open(page.converter, &error);
    ucnv_setToUCallBack(m_icu, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
    ucnv_setFromUCallBack(m_icu, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
    if (U_FAILURE(error)) Close();
  }
  Converter(const Converter&) = delete;
  Converter& operator=(const Converter&) = delete;
  ~Converter() { Close(); }

  bool IsOpen() const { return m_icu != nullptr || m_iconv != reinterpret_cast<iconv_t>(-1); }

  // The one character that the bytes stand for, or -1.
  int Decode(const char* bytes, int count) {
    WCHAR text[4];
    if (m_icu != nullptr) {
      UErrorCode error = U_ZERO_ERROR;
      const char* from = bytes;
      WCHAR* to = text;
      ucnv_resetToUnicode(m_icu);
      ucnv_toUnicode(m_icu, &to, text + 4, &from, bytes + count, nullptr, true, &error);
      return U_SUCCESS(error) && to == text + 1 ? text[0] : -1;
    }
    char* from = const_cast<char*>(bytes);
    char* to = reinterpret_cast<char*>(text);
    std::size_t fromLeft = static_cast<std::size_t>(count), toLeft = sizeof text;
    iconv(m_iconv, nullptr, nullptr, nullptr, nullptr);
    const bool good = iconv(m_iconv, &from, &fromLeft, &to, &toLeft) != static_cast<std::size_t>(-1);
    return good && toLeft == sizeof text - sizeof(WCHAR) ? text[0] : -1;
  }

  // The code of a character, or -1.
  int Encode(WCHAR c, bool fallback) {
    if (m_icu == nullptr) return -1;
    char bytes[8];
    UErrorCode error = U_ZERO_ERROR;
    const WCHAR* from = &c;
    char* to = bytes;
    ucnv_setFallback(m_icu, fallback);
    ucnv_resetFromUnicode(m_icu);
    ucnv_fromUnicode(m_icu, &to, bytes + sizeof bytes, &from, &c + 1, nullptr, true, &error);
    if (U_FAILURE(error) || to == bytes || to > bytes + 2) return -1;
    const int first = static_cast<std::uint8_t>(bytes[0]);
    return to == bytes + 1 ? first : first * 256 + static_cast<std::uint8_t>(bytes[1]);
  }

 private:
  void Close() {
    ucnv_close(m_icu);
    m_icu = nullptr;
    if (m_iconv != reinterpret_cast<iconv_t>(-1)) iconv_close(m_iconv);
  }

  UConverter* m_icu = nullptr;
  iconv_t m_iconv = reinterpret_cast<iconv_t>(-1);
};

// What a lead and a trail stand for, or 0. Page 20932 is EUC-JP in two bytes at most: its characters of three bytes
// leave the first one, 8F, out and have a trail below 80.
WCHAR DecodePair(const CodePageInfo& page, Converter& converter, unsigned lead, unsigned trail) {
  const bool isShortened = page.number == 20932 && lead != 0x8E && trail < 0x80;
  const char whole[3] = {'\x8F', static_cast<char>(lead), static_cast<char>(trail | (isShortened ? 0x80 : 0))};
  const int value = isShortened ? converter.Decode(whole, 3) : converter.Decode(whole + 1, 2);
  return static_cast<WCHAR>(value > 0 ? value : 0);
}

template <class Action>
void ForEachPatch(const CodePageInfo& page, Action action) {
  for (const Patch& patch : kPatches) {
    if (patch.page != page.number) continue;
    for (unsigned code = patch.first; code <= patch.last; ++code)
      action(code, static_cast<WCHAR>(patch.value + (code - patch.first) * patch.step), patch.valid);
  }
}

std::unique_ptr<DecodeTable> MakeDecodeTable(const CodePageInfo& page) {
  auto table = std::make_unique<DecodeTable>();
  Converter converter(page);
  table->defaultChar = page.defaultChar;
  if (page.maxBytes == 2) table->doubles = std::make_unique<WCHAR[]>(65536);
  for (unsigned byte = 0; byte < 256; ++byte) {
    const char single = static_cast<char>(byte);
    table->single[byte] = page.defaultChar;
    if (page.IsLead(static_cast<std::uint8_t>(byte))) {
      table->kind[byte] = DecodeTable::kLead;
      for (unsigned trail = 0; trail < 256; ++trail)
        table->doubles[byte * 256 + trail] = DecodePair(page, converter, byte, trail);
      continue;
    }
    const int value = converter.Decode(&single, 1);
    table->kind[byte] = value >= 0 ? 0 : DecodeTable::kInvalid;
    if (value >= 0) table->single[byte] = static_cast<WCHAR>(value);
  }
  ForEachPatch(page, [&](unsigned code, WCHAR value, bool valid) {
    if (code > 0xFF) {
      table->doubles[code] = value;
    } else if (table->kind[code] != DecodeTable::kLead) {
      table->single[code] = value;
      table->kind[code] = valid ? 0 : DecodeTable::kInvalid;
    }
  });
  table->asciiIdentity = true;
  table->hasInvalid = page.maxBytes > 1;
  for (unsigned byte = 0; byte < 256; ++byte) {
    if (byte < 0x80 && table->single[byte] != byte) table->asciiIdentity = false;
    if (table->kind[byte] == DecodeTable::kInvalid) table->hasInvalid = true;
  }
  return table;
}

// What a code stands for; -1 for none.
int ValueOf(const DecodeTable& table, unsigned code) {
  if (code > 0xFF) return table.doubles != nullptr && table.doubles[code] != 0 ? table.doubles[code] : -1;
  return table.kind[code] == 0 ? table.single[code] : -1;
}

// The letter under the accents, or NUL for what is no accented letter.
WCHAR BaseLetter(WCHAR c) {
  UErrorCode error = U_ZERO_ERROR;
  WCHAR parts[32];
  const std::int32_t length = unorm2_getDecomposition(unorm2_getNFKDInstance(&error), c, parts, 32, &error);
  if (U_FAILURE(error) || length < 1) return 0;
  for (std::int32_t i = 1; i < length; ++i)
    if (u_charType(parts[i]) != U_NON_SPACING_MARK) return 0;
  return parts[0];
}

std::unique_ptr<EncodeTable> MakeEncodeTable(const CodePageInfo& page, const DecodeTable& decode) {
  auto table = std::make_unique<EncodeTable>();
  Converter converter(page);
  const bool latinStandIn = std::strcmp(page.converter, "ISO-8859-1") == 0 && page.number != 28591;
  for (unsigned c = 1; c < 65536; ++c) {
    const int exact = converter.Encode(static_cast<WCHAR>(c), false);
    if (exact >= 0 && ValueOf(decode, static_cast<unsigned>(exact)) == static_cast<int>(c))
      table->exact[c] = table->fit[c] = static_cast<std::uint16_t>(exact);
  }
  // What the corrections (and the converters that only decode) add; the lowest code wins.
  for (unsigned code = 1; code < (page.maxBytes == 2 ? 65536u : 256u); ++code) {
    const int value = ValueOf(decode, code);
    if (value > 0 && table->exact[value] == 0)
      table->exact[value] = table->fit[value] = static_cast<std::uint16_t>(code);
  }
  ForEachPatch(page, [&](unsigned code, WCHAR value, bool valid) {
    if (!valid && value != 0 && table->exact[value] == 0)
      table->exact[value] = table->fit[value] = static_cast<std::uint16_t>(code);
  });
  for (unsigned c = 1; c < 65536; ++c) {
    if (table->exact[c] != 0) continue;
    const int fit = latinStandIn ? -1 : converter.Encode(static_cast<WCHAR>(c), true);
    table->fit[c] = fit >= 0 ? static_cast<std::uint16_t>(fit) : table->exact[BaseLetter(static_cast<WCHAR>(c))];
  }
  return table;
}

template <class Table, class Make>
const Table& Publish(std::atomic<const Table*>& slot, Make make) {
  const Table* table = slot.load(std::memory_order_acquire);
  if (table != nullptr) [[likely]]
    return *table;
  const std::lock_guard lock(g_making);
  table = slot.load(std::memory_order_relaxed);
  if (table == nullptr) {
    table = make().release();  // kept for the life of the process
    slot.store(table, std::memory_order_release);
  }
  return *table;
}

}  // namespace

UINT ResolveCodePage(UINT page) {
  switch (page) {
    case CP_ACP:
    case CP_THREAD_ACP:
      return GetACP();
    case CP_OEMCP:
      return GetOEMCP();
    case CP_MACCP:
      return 10000;
    default:
      return page;
  }
}

const CodePageInfo* FindCodePage(UINT resolved) {
  const auto* found = std::lower_bound(std::begin(kPages), std::end(kPages), resolved,
                                       [](const CodePageInfo& page, UINT number) { return page.number < number; });
  return found != std::end(kPages) && found->number == resolved && IsInstalled(*found) ? found : nullptr;
}

CodePageRange AllCodePages() { return {std::begin(kPages), std::end(kPages)}; }

bool IsInstalled(const CodePageInfo& page) {
  if (*page.converter == 0) return true;
  enum : signed char { kUnknown, kMissing, kThere };
  static std::atomic<signed char> states[kPageCount];
  std::atomic<signed char>& state = states[&page - kPages];
  if (state.load(std::memory_order_relaxed) == kUnknown)
    state.store(Converter(page).IsOpen() ? kThere : kMissing, std::memory_order_relaxed);
  return state.load(std::memory_order_relaxed) == kThere;
}

const DecodeTable& GetDecodeTable(const CodePageInfo& page) {
  return Publish(g_decodeTables[&page - kPages], [&] { return MakeDecodeTable(page); });
}

const EncodeTable& GetEncodeTable(const CodePageInfo& page) {
  const DecodeTable& decode = GetDecodeTable(page);
  return Publish(g_encodeTables[&page - kPages], [&] { return MakeEncodeTable(page, decode); });
}

}  // namespace platform
