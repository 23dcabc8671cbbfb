// SString: the library's one text type, a shared, copy-on-write string of UTF-16 code units.
//
// Copies share one buffer; it is copied only when a holder writes. An SString is one pointer in
// size, is never null, and converts to a terminated const WCHAR* at no cost. Copying is O(1);
// strings up to 2048 characters live in pools and never touch the heap; there is no geometric
// growth (build long texts with SStringBuffer).
//
// Threads: strings that share a buffer may be used in different threads; one SString object written
// by two threads at once is not protected.
//
// Unless a member says otherwise: lengths and indices count code units; a null text argument is an
// empty text; a text argument may lie in the string's own buffer; the only exception thrown is
// SEOutOfMemory, and it leaves the string as it was.
#pragma once

#include <compare>
#include <concepts>
#include <cstdarg>
#include <cstring>
#include <functional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string_data.h"

class SStringBuffer;

// What may be passed in place of "..." to the functions that format: numbers, characters, enumerations and pointers.
template <class T>
inline constexpr bool SIsFormatArgument = std::is_arithmetic_v<std::decay_t<T>> || std::is_enum_v<std::decay_t<T>> ||
                                          std::is_pointer_v<std::decay_t<T>> || std::is_null_pointer_v<std::decay_t<T>>;

// Is there when one of the types may not be passed.
template <class... Arguments>
using SIfNoFormatArguments = std::enable_if_t<!(SIsFormatArgument<Arguments> && ...)>;

// What a pointer that is no text points to.
template <class T>
concept SOtherThanText = !std::same_as<T, WCHAR> && !std::same_as<T, char>;

// The shared buffer of all empty strings.
extern QXCORE_API const SStaticString<0> g_emptyString;

class QXCORE_API SString {
 public:
  // --- constant strings, shared without allocation ---
  static const SString null;   // ""
  static const SString Yes;    // "Yes"
  static const SString No;     // "No"
  static const SString Space;  // " "
  static const SString CrLf;   // carriage return, line feed

  // --- construction ---
  SString() noexcept : m_text(EmptyText()) {}
  SString(std::nullptr_t) noexcept : SString() {}
  SString(const SString& other) : m_text(other.m_text) {
    std::int32_t refs = other.Data()->Refs();
    if (refs >= 0) [[likely]] {
      platform::InterlockedAddOne(Data()->m_refs);
    } else if (refs == SStringData::kLocked) {
      CopyLocked(other);
    }
  }
  SString(SString&& other) noexcept : m_text(other.m_text) { other.m_text = EmptyText(); }
  SString(const WCHAR* text);
  SString(SStringView text);
  SString(const char* text);                      // converted with the ANSI code page
  SString(const char* text, int count);           // at most `count` bytes of it, stopping at a NUL
  explicit SString(const SStringBuffer& buffer);  // explicit, for the builder converts by itself, too
  explicit SString(int truth);                    // SString::Yes when not 0, else SString::No; not a number's digits
  template <std::same_as<bool> Truth>
  explicit SString(Truth truth) : SString(static_cast<int>(truth)) {}
  explicit SString(long number);                 // "%ld"; do not pass a LONG, which is an int on some targets
  explicit SString(double number);               // "%g"
  SString(HINSTANCE instance, unsigned int id);  // LoadString(id, instance)

  // One character or another integer would silently become "Yes"; assign characters, cast integers.
  SString(char) = delete;
  SString(signed char) = delete;
  SString(unsigned char) = delete;
  SString(char8_t) = delete;
  SString(char16_t) = delete;
  SString(char32_t) = delete;
  SString(wchar_t) = delete;
  SString(short) = delete;
  SString(unsigned short) = delete;
  SString(unsigned int) = delete;
  SString(unsigned long) = delete;
  SString(long long) = delete;
  SString(unsigned long long) = delete;
  // No other pointer is a text: neither one to characters of another kind nor one that would be a truth.
  template <SOtherThanText T>
  explicit SString(T*) = delete;

  ~SString() { ReleaseData(); }

  // Makes the object anew, as the matching constructor does; the former text is given up.
  void Init(const char* text) { InitFrom(SString(text)); }
  void Init(const WCHAR* text) { InitFrom(SString(text)); }
  void Init(const SString& text) { InitFrom(SString(text)); }

  // --- assignment ---
  // Shares the buffer where neither side is locked. A locked target keeps its buffer when the text
  // fits; given an empty text it keeps its length, too, and only its first character becomes NUL,
  // which is on purpose: UnlockBuffer(true) measures anew.
  SString& operator=(const SString& other);
  SString& operator=(SString&& other);
  SString& operator=(const WCHAR* text);
  SString& operator=(SStringView text);
  SString& operator=(const char* text);
  SString& operator=(std::nullptr_t) { return *this = SString::null; }
  SString& operator=(WCHAR character);
  SString& operator=(char character);
  SString& operator=(const SStringBuffer& buffer);
  SString& operator=(int) = delete;
  SString& operator=(long) = delete;

  SString& operator+=(const SString& text);
  SString& operator+=(const WCHAR* text);
  SString& operator+=(SStringView text);
  SString& operator+=(const char* text);
  SString& operator+=(WCHAR character) {
    ConcatInPlace(1, &character);
    return *this;
  }
  SString& operator+=(char character);
  SString& operator+=(const SStringBuffer& buffer);
  SString& operator+=(int) = delete;
  SString& operator+=(long) = delete;

  // --- access ---
  int Length() const { return Data()->m_length; }
  int LengthTchar() const { return Data()->m_length; }
  int LengthByte() const { return Data()->m_length * 2; }
  int GetAllocLength() const { return Data()->m_allocLength; }  // characters that fit without a new buffer
  bool IsEmpty() const { return Data()->m_length == 0; }
  WCHAR GetAt(int index) const { return m_text[index]; }  // 0 <= index <= Length(); unchecked
  template <std::integral Index>
  WCHAR operator[](Index index) const {
    return m_text[index];
  }
  void SetAt(int index, WCHAR character);  // 0 <= index < Length(); others are ignored
  const WCHAR* GetPointerAt(int index) const { return m_text + index; }
  const WCHAR* GetSafePointer() const { return m_text; }  // never null
  operator const WCHAR*() const { return m_text; }
  operator SStringView() const { return View(); }
  // A terminated text; none for a null pointer.
  static SStringView ViewOf(const WCHAR* text) { return text != nullptr ? SStringView(text) : SStringView(); }
  SStringView View() const { return SStringView(m_text, static_cast<std::size_t>(Length())); }
  const WCHAR* begin() const { return m_text; }
  const WCHAR* end() const { return m_text + Length(); }
  void Done() { Release(); }  // gives the buffer up; the string becomes empty
  void Release() {
    ReleaseData();
    m_text = EmptyText();
  }
  void Swap(SString& other) noexcept {
    WCHAR* text = m_text;
    m_text = other.m_text;
    other.m_text = text;
  }

  // --- comparison: negative, 0 or positive ---
  // Each order has four forms: the whole text; at most `count` characters; the same from index
  // `start` (0 <= start <= Length(), unchecked) of this string. Against a null text the result is 0
  // for an empty string and 1 otherwise. Comparison ends at the first NUL of either side.
  int Compare(const WCHAR* text) const;  // by code unit
  int Compare(const WCHAR* text, int count) const;
  int Compare(int start, const WCHAR* text) const;
  int Compare(int start, const WCHAR* text, int count) const;
  // By code unit after mapping to lower case, one to one and without regard to a locale.
  int CompareNoCase(const WCHAR* text) const;
  int CompareNoCase(const WCHAR* text, int count) const;
  int CompareNoCase(int start, const WCHAR* text) const;
  int CompareNoCase(int start, const WCHAR* text, int count) const;
  // By the runtime's locale (LC_COLLATE); code-unit order in the "C" locale.
  int Collate(const WCHAR* text) const;
  int Collate(const WCHAR* text, int count) const;
  int Collate(int start, const WCHAR* text) const;
  int Collate(int start, const WCHAR* text, int count) const;
  int CollateNoCase(const WCHAR* text) const;
  int CollateNoCase(const WCHAR* text, int count) const;
  int CollateNoCase(int start, const WCHAR* text) const;
  int CollateNoCase(int start, const WCHAR* text, int count) const;
  // Natural order with numbers, see _tcscmpi in natural_compare.h.
  int CompareNb(const WCHAR* text) const;
  int CompareNb(const WCHAR* text, int count) const;
  int CompareNb(int start, const WCHAR* text) const;
  int CompareNb(int start, const WCHAR* text, int count) const;
  int CompareNbNoCase(const WCHAR* text) const;
  int CompareNbNoCase(const WCHAR* text, int count) const;
  int CompareNbNoCase(int start, const WCHAR* text) const;
  int CompareNbNoCase(int start, const WCHAR* text, int count) const;

  // The operators compare all characters by code unit, an inner NUL included.
  friend bool operator==(const SString& a, const SString& b) { return a.m_text == b.m_text || a.View() == b.View(); }
  friend bool operator==(const SString& a, const WCHAR* b) { return a.View() == ViewOf(b); }
  friend bool operator==(const SString& a, SStringView b) { return a.View() == b; }
  friend std::strong_ordering operator<=>(const SString& a, const SString& b) { return a.View() <=> b.View(); }
  friend std::strong_ordering operator<=>(const SString& a, const WCHAR* b) { return a.View() <=> ViewOf(b); }
  friend std::strong_ordering operator<=>(const SString& a, SStringView b) { return a.View() <=> b; }

  // --- search: pointers into this string, or null where nothing is found ---
  // `from` is a pointer into this string at which the search begins. ReverseFind returns the last
  // occurrence that begins at or before `from`. An empty text is found at once, where the search begins.
  const WCHAR* Find(WCHAR character) const;
  const WCHAR* Find(const WCHAR* text) const;
  const WCHAR* Find(WCHAR character, const WCHAR* from) const;
  const WCHAR* Find(const WCHAR* text, const WCHAR* from) const;
  const WCHAR* FindNoCase(const WCHAR* text) const;
  const WCHAR* FindNoCase(const WCHAR* text, const WCHAR* from) const;
  const WCHAR* ReverseFind(WCHAR character) const;
  const WCHAR* ReverseFind(const WCHAR* text) const;
  const WCHAR* ReverseFind(const WCHAR* text, const WCHAR* from) const;
  const WCHAR* ReverseFindNoCase(const WCHAR* text) const;
  const WCHAR* ReverseFindNoCase(const WCHAR* text, const WCHAR* from) const;
  // Index of the first `character` at or after `start`, of the last one at or before it. -1 when there
  // is none, when the string is empty, when start is negative or above Length() - 1.
  int FindPos(WCHAR character, int start = 0) const;
  int ReverseFindPos(WCHAR character, int start) const;
  // Wildcard match of the whole string: '*' any run, '?' any one character, '\' makes the next pattern
  // character literal (alone at the end it stands for itself). 1 or 0. Takes time of at most length
  // times pattern.
  int Match(const WCHAR* pattern) const;
  int MatchNoCase(const WCHAR* pattern) const;

  // --- extraction ---
  // Negative arguments count as 0; counts are clipped to what is there.
  SString Left(int count) const;
  SString Right(int count) const;
  SString Mid(int first, int count) const;
  SString Mid(int first) const;
  // The part before the first `separator`; the whole text when it does not occur.
  SString Split(WCHAR separator) const;
  // The same, and the part behind the separator in *rest (may be null or this string); empty when
  // the separator ends the text or does not occur.
  SString Split(SString* rest, WCHAR separator) const;
  // Both parts (either may be null or this string). 1 when the separator occurs; else 0, with the
  // whole text on the left and nothing on the right.
  int Split(SString* left, SString* right, WCHAR separator) const;

  // --- modification ---
  // Inserts before `index`, clipped to 0...Length(). Returns the new length.
  int Insert(const WCHAR* text, int index);
  int Insert(WCHAR character, int index);
  // Deletes up to `count` characters from `index` on; out-of-range parts are ignored. Returns the new length.
  int Delete(int index, int count = 1);
  void MakeReverse();  // by code unit
  void ToUpper();      // one-to-one, without regard to a locale
  void ToLower();
  void ToUpper(int index);  // one character; an index out of range is ignored
  void ToLower(int index);
  void Trim();  // white space from both ends
  void Trim(WCHAR character);
  void Trim(const WCHAR* set);
  void TrimLeft();
  void TrimLeft(WCHAR character);
  void TrimLeft(const WCHAR* set);
  void TrimRight();
  void TrimRight(WCHAR character);
  void TrimRight(const WCHAR* set);
  // Replaces the first occurrence; 1 when there was one, else 0.
  int Replace(const WCHAR* oldText, const WCHAR* newText);
  int Replace(WCHAR oldCharacter, WCHAR newCharacter);
  int ReplaceNoCase(const WCHAR* oldText, const WCHAR* newText);
  // Replaces every occurrence from left to right, not looking into what was put in. Returns the number
  // of replacements; 0, and nothing changed, when `oldText` is empty or does not occur.
  int ReplaceAll(const WCHAR* oldText, const WCHAR* newText);
  int ReplaceAll(WCHAR oldCharacter, WCHAR newCharacter);
  int ReplaceAllNoCase(const WCHAR* oldText, const WCHAR* newText);
  // Replaces each character that stands in `from` by the one at the same place in `to`, up to the end
  // of the shorter set. Returns the number of characters replaced.
  int Translate(const WCHAR* from, const WCHAR* to);
  // Replaces accented letters by their base letters, where the platform knows a composition. With
  // arguments: only `count` characters from `first` on (negative count: to the end). Returns the number
  // of characters changed.
  int NoAccent(int first = 0, int count = -1);
  // Each character through the OEM code page, one byte a character, as the platform's functions do.
  void CharToOemW();
  void OemToCharW();
  // Copies the text out, terminated: 2 * Length() + 1 bytes of the ANSI code page at most, or
  // Length() + 1 characters. Returns dst.
  char* ToAnsi(char* dst) const;
  WCHAR* ToUnicode(WCHAR* dst) const;
  // UTF-8 by the standard (RFC 3629), for program arguments, std::string and native interfaces: sequences of four
  // bytes are surrogate pairs and the other way round, so that every Unicode text comes back whole; an inner NUL
  // stays. Bytes that are no UTF-8 become U+FFFD, one for each longest part that could have begun a character, and
  // so does half of a surrogate pair. ToUtf8 may throw std::bad_alloc.
  static SString FromUtf8(std::string_view text);
  std::string ToUtf8() const;

  // --- classification ---
  // Ask for the character at an index; 0 for an index out of range.
  int IsASCII(int index) const;
  int IsAlpha(int index) const;
  int IsAlphaNum(int index) const;
  int IsDigit(int index) const;
  int IsLower(int index) const;
  int IsUpper(int index) const;
  int IsWhitespace(int index) const;
  int IsXDigit(int index) const;
  // Ask for the whole string.
  int IsInteger() const;         // a sign or none, then decimal digits
  int IsNumber() const;          // what ToDouble reads to its end: sign, digits, point, exponent
  int CanConvertToMBCS() const;  // the text survives the way to the ANSI code page and back
  int IsRtf() const;             // begins with "{\rtf" or "{\urtf"
  static int IsRtfText(const WCHAR* text);

  // --- numbers: leading white space is skipped, reading stops at the first character that does not fit ---
  long ToLONG() const;  // 32-bit; what exceeds it is clipped to the nearest value
  unsigned long ToULONG() const;
  double ToDouble() const;  // decimal point '.', whatever the locale
  int ToBOOL() const;       // 1 for "Yes" in any case and for a number other than 0

  // --- formatting ---
  // printf conventions: %s is wide text, %S and %hs narrow text. The arguments may be this string's own
  // text. An empty format makes the string empty. What the runtime cannot convert leaves it empty.
  void Format(const WCHAR* format, ...);
  void Format(unsigned int id, ...);  // the format is a text of the library's string table
  void FormatV(const WCHAR* format, std::va_list arguments);
  // Objects are no arguments: of a string, pass GetSafePointer().
  template <class... Arguments, class = SIfNoFormatArguments<Arguments...>>
  void Format(const WCHAR* format, const Arguments&... arguments) = delete;
  template <class... Arguments, class = SIfNoFormatArguments<Arguments...>>
  void Format(unsigned int id, const Arguments&... arguments) = delete;

  // Loads text `id` of the module's string table, whatever its length; with a null instance of the
  // module that SGetResInstance names. Non-zero when at least one character was loaded; else the
  // string is empty.
  int LoadStringW(unsigned int id, HINSTANCE instance = nullptr);

  // --- writable buffers ---
  // Room for n characters (0 counts as 1); keeps the text up to n. End with Unlock.
  WCHAR* Lock(int n) { return LockTchar(n); }
  WCHAR* LockTchar(int n);
  // The same, and marks the buffer as lent out: copies of the string are deep until UnlockBuffer. The
  // length becomes n; n < 1 means the present length (1 for an empty string).
  WCHAR* LockBuffer(int n = 0);
  WCHAR* LockBufferTchar(int n = 0) { return LockBuffer(n); }
  // Ends LockBuffer. With `recalc` the length becomes the position of the first NUL.
  void UnlockBuffer(bool recalc = true);
  // Ends Lock: the length becomes n, or the position of the first NUL for n = -1. Unlike UnlockBuffer it
  // leaves the mark of a lent-out buffer as it is; that is on purpose.
  void Unlock(int n = -1);
  void UnlockTchar(int n = -1) { Unlock(n); }
  // A buffer of exactly n characters, which the caller fills; not marked as lent out. n < 1 gives an empty string, with
  // room for one character.
  WCHAR* GetBufferSetLength(int n);
  WCHAR* GetBufferSetTcharLength(int n);

  // --- the steps that writing is made of ---
  void CopyBeforeWrite();        // makes the buffer this string's own
  void AllocBeforeWrite(int n);  // an own buffer for n characters; the old text is not kept
  void AssignCopy(int n, const WCHAR* text);
  void ConcatInPlace(int n, const WCHAR* text) {
    SStringData* data = Data();
    if (n > 0 && n <= data->m_allocLength - data->m_length && IsOwn(data)) [[likely]] {
      AppendInPlace(data, n, text);
    } else {
      ConcatByCopy(n, text);
    }
  }
  static SString ConcatCopy(int n1, const WCHAR* text1, int n2, const WCHAR* text2);

  // --- memory ---
  // Returns the unused blocks of all string pools back to the heap; takes no memory. Returns what was released.
  static long FreeUnused();
  static long GetLargeBufferBytes();  // bytes held by buffers above 2048 characters
  static long GetLargeBufferCount();  // and their number

 private:
  friend class SStringBuffer;
  struct Adopt {};  // takes over a buffer whose count is already right
  SString(Adopt, WCHAR* text) noexcept : m_text(text) {}
  template <int kLength>
  constexpr explicit SString(const SStaticString<kLength>& text) noexcept : m_text(const_cast<WCHAR*>(text.m_text)) {}

  static WCHAR* EmptyText() { return const_cast<WCHAR*>(g_emptyString.m_text); }
  SStringData* Data() { return SStringData::Of(m_text); }
  const SStringData* Data() const { return SStringData::Of(const_cast<const WCHAR*>(m_text)); }
  // Not shared and not static: this string alone may write.
  static bool IsOwn(const SStringData* data) {
    std::int32_t refs = data->Refs();
    return refs == 1 || refs == SStringData::kLocked;
  }
  static void AppendInPlace(SStringData* data, int n, const WCHAR* text) {
    WCHAR* end = data->Text() + data->m_length;
    std::memmove(end, text, static_cast<std::size_t>(n) * sizeof(WCHAR));
    end[n] = 0;
    data->m_length += n;
  }
  void ConcatByCopy(int n, const WCHAR* text);
  void InitFrom(SString fresh) { Swap(fresh); }
  void AssignActual(int n, const WCHAR* text);
  void ReleaseData() noexcept {
    SStringData* data = Data();
    std::int32_t refs = data->Refs();
    if (refs == SStringData::kStatic) return;
    if (refs > 1 && platform::InterlockedTakeOne(data->m_refs) >= 1) return;
    FreeData(data);
  }
  void CopyLocked(const SString& other);
  int ReplaceFirst(const WCHAR* found, int oldLength, const WCHAR* newText);
  template <class Finder>
  int ReplaceEvery(const WCHAR* oldText, const WCHAR* newText, Finder find);
  template <class IsStripped>
  void TrimBy(bool left, bool right, IsStripped isStripped);
  template <class Order>
  int CompareBy(int start, const WCHAR* text, Order order) const;

  // Buffers: string_memory.cpp.
  static WCHAR* AllocBuffer(int n);              // count 1, length n, terminated
  static bool IsLarge(const SStringData* data);  // of the heap, not of a pool
  void GrowLarge(int n);                         // room for n characters in a large buffer that nobody shares
  static void FreeData(SStringData* data) noexcept;

  WCHAR* m_text;
};

static_assert(sizeof(SString) == sizeof(void*), "a string is one pointer");

// --- concatenation: one allocation each; a temporary on the left grows in place where it fits ---

QXCORE_API SString operator+(const SString& a, const SString& b);
QXCORE_API SString operator+(const SString& a, const WCHAR* b);
QXCORE_API SString operator+(const WCHAR* a, const SString& b);
QXCORE_API SString operator+(const SString& a, const char* b);
QXCORE_API SString operator+(const char* a, const SString& b);
QXCORE_API SString operator+(const SString& a, WCHAR b);
QXCORE_API SString operator+(WCHAR a, const SString& b);
QXCORE_API SString operator+(const SString& a, char b);
QXCORE_API SString operator+(char a, const SString& b);
inline SString operator+(SString&& a, const SString& b) { return std::move(a += b); }
inline SString operator+(SString&& a, const WCHAR* b) { return std::move(a += b); }
inline SString operator+(SString&& a, const char* b) { return std::move(a += b); }
inline SString operator+(SString&& a, WCHAR b) { return std::move(a += b); }
inline SString operator+(SString&& a, char b) { return std::move(a += b); }
SString operator+(const SString&, int) = delete;   // neither a number's digits
SString operator+(const SString&, long) = delete;  // nor a step of a pointer

// The text of the string table, or `fallback` where the table has none.
QXCORE_API SString SStringLoad(unsigned int id, const WCHAR* fallback = nullptr, HINSTANCE instance = nullptr);

template <>
struct std::hash<SString> {
  std::size_t operator()(const SString& text) const noexcept { return std::hash<SStringView>()(text.View()); }
};
