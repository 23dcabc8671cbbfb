// Character formats of rich-edit controls, between the document's terms and those of the messages.

#include <algorithm>
#include <cstring>

#include "qxcore/platform/posix/controls/document_edit.h"
#include "qxcore/platform/posix/controls/rich_edit_control.h"

namespace platform::rich {
namespace {

constexpr LONG kTwips = 10;  // in half a point
constexpr DWORD kKnown = CFM_BOLD | CFM_ITALIC | CFM_UNDERLINE | CFM_STRIKEOUT | CFM_HIDDEN | CFM_ALLCAPS |
                         CFM_SMALLCAPS | CFM_SUBSCRIPT | CFM_SIZE | CFM_COLOR | CFM_FACE | CFM_CHARSET;

struct Effect {
  std::uint16_t flag;
  DWORD effect;
};
constexpr Effect kEffects[] = {
    {CharFormat::kBold, CFE_BOLD},           {CharFormat::kItalic, CFE_ITALIC}, {CharFormat::kUnderline, CFE_UNDERLINE},
    {CharFormat::kStrike, CFE_STRIKEOUT},    {CharFormat::kHidden, CFE_HIDDEN}, {CharFormat::kCaps, CFE_ALLCAPS},
    {CharFormat::kSmallCaps, CFE_SMALLCAPS}, {CharFormat::kSub, CFE_SUBSCRIPT}, {CharFormat::kSuper, CFE_SUPERSCRIPT},
};

const Font* FontOf(const Document& document, const CharFormat& format) {
  const auto place = static_cast<std::size_t>(format.font);
  return format.font >= 0 && place < document.fonts.size() ? &document.fonts[place] : nullptr;
}

const Color* ColorOf(const Document& document, std::int32_t place) {
  const bool isThere = place >= 0 && static_cast<std::size_t>(place) < document.colors.size();
  const Color* color = isThere ? &document.colors[static_cast<std::size_t>(place)] : nullptr;
  return color != nullptr && !color->isDefault ? color : nullptr;
}

COLORREF ValueOf(const Color* color) { return color != nullptr ? RGB(color->red, color->green, color->blue) : 0; }

CHARFORMAT2W Describe(const Document& document, const CharFormat& format) {
  CHARFORMAT2W described = {};
  described.dwMask = kKnown | CFM_BACKCOLOR;
  for (const Effect& pair : kEffects) {
    if ((format.flags & pair.flag) != 0) described.dwEffects |= pair.effect;
  }
  described.yHeight = format.size * kTwips;
  const Color* color = ColorOf(document, format.color);
  const Color* back = ColorOf(document, format.back);
  if (color == nullptr) described.dwEffects |= CFE_AUTOCOLOR;
  if (back == nullptr) described.dwEffects |= CFE_AUTOBACKCOLOR;
  described.crTextColor = ValueOf(color);
  described.crBackColor = ValueOf(back);
  if (const Font* font = FontOf(document, format)) {
    described.bCharSet = static_cast<BYTE>(font->charset >= 0 ? font->charset : DEFAULT_CHARSET);
    font->name.copy(described.szFaceName, LF_FACESIZE - 1);
  }
  return described;
}

// Takes out of the mask what another format has differently.
void KeepCommon(CHARFORMAT2W& format, const CHARFORMAT2W& other) {
  DWORD different = (format.dwEffects ^ other.dwEffects) & format.dwMask;
  if ((different & CFM_SUBSCRIPT) != 0) different |= CFM_SUBSCRIPT;
  if (format.yHeight != other.yHeight) different |= CFM_SIZE;
  if (format.crTextColor != other.crTextColor) different |= CFM_COLOR;
  if (format.crBackColor != other.crBackColor) different |= CFM_BACKCOLOR;
  if (format.bCharSet != other.bCharSet) different |= CFM_CHARSET;
  if (std::u16string_view(format.szFaceName) != other.szFaceName) different |= CFM_FACE;
  format.dwMask &= ~different;
  format.dwEffects &= ~different;
}

// --- setting ---

template <class Entry, class Same>
std::int32_t FindOrAdd(std::vector<Entry>& entries, const Entry& entry, Same same) {
  const auto found = std::find_if(entries.begin(), entries.end(), same);
  const auto place = static_cast<std::int32_t>(found - entries.begin());
  if (found == entries.end()) entries.push_back(entry);
  return place;
}

// The first place is the default colour's, as writers of RTF have it.
std::int32_t PlaceOfColor(Document& document, COLORREF value) {
  if (document.colors.empty()) document.colors.emplace_back();
  const Color color = {false, GetRValue(value), GetGValue(value), GetBValue(value)};
  return FindOrAdd(document.colors, color, [&](const Color& other) { return other == color; });
}

std::int32_t PlaceOfFont(Document& document, const CharFormat& format, const CHARFORMATW& wanted) {
  const Font* former = FontOf(document, format);
  Font font = former != nullptr ? *former : Font();
  if ((wanted.dwMask & CFM_FACE) != 0) {
    font = Font();
    font.charset = former != nullptr ? former->charset : -1;
    font.name.assign(wanted.szFaceName, std::find(wanted.szFaceName, wanted.szFaceName + LF_FACESIZE, u'\0'));
  }
  if ((wanted.dwMask & CFM_CHARSET) != 0) font.charset = wanted.bCharSet;
  for (const Font& other : document.fonts) font.number = std::max(font.number, other.number + 1);
  return FindOrAdd(document.fonts, font,
                   [&](const Font& other) { return other.name == font.name && other.charset == font.charset; });
}

CharFormat Changed(Document& document, CharFormat format, const CHARFORMAT2W& wanted) {
  for (const Effect& pair : kEffects) {
    if ((wanted.dwMask & pair.effect) == 0) continue;
    const bool isSet = (wanted.dwEffects & pair.effect) != 0;
    format.flags = static_cast<std::uint16_t>(isSet ? format.flags | pair.flag : format.flags & ~pair.flag);
  }
  if ((wanted.dwMask & CFM_SIZE) != 0)
    format.size = static_cast<std::int16_t>(std::clamp<LONG>(wanted.yHeight / kTwips, 1, 0x7FFF));
  const auto color = [&](DWORD isDefault, COLORREF value) {
    return (wanted.dwEffects & isDefault) != 0 ? CharFormat::kNone : PlaceOfColor(document, value);
  };
  if ((wanted.dwMask & CFM_COLOR) != 0) format.color = color(CFE_AUTOCOLOR, wanted.crTextColor);
  if ((wanted.dwMask & CFM_BACKCOLOR) != 0) format.back = color(CFE_AUTOBACKCOLOR, wanted.crBackColor);
  if ((wanted.dwMask & (CFM_FACE | CFM_CHARSET)) != 0) format.font = PlaceOfFont(document, format, wanted);
  return format;
}

// What a message says, as the longer structure; false for one of an unknown size.
bool Widen(const CHARFORMATW& given, CHARFORMAT2W& format) {
  format = {};
  if (given.cbSize != sizeof(CHARFORMATW) && given.cbSize != sizeof(CHARFORMAT2W)) return false;
  std::memcpy(static_cast<void*>(&format), &given, given.cbSize);
  if (given.cbSize == sizeof(CHARFORMATW)) format.dwMask &= ~static_cast<DWORD>(CFM_BACKCOLOR);
  return true;
}

// The formats that the selection has. An empty one has that of what is put in next.
std::vector<CharFormat> SelectedFormats(const Control& control) {
  const Runs<CharFormat>& runs = control.document.characters;
  const Span span = SelectedSpan(control);
  if (span.start == span.end) {
    return {control.typing.value_or(FormatAt(runs, span.start > 0 ? span.start - 1 : 0))};
  }
  std::vector<CharFormat> formats = {FormatAt(runs, span.start)};
  for (const auto& run : runs) {
    if (run.start > span.start && run.start < span.end) formats.push_back(run.format);
  }
  return formats;
}

}  // namespace

LRESULT GetCharFormat(const Control& control, CHARFORMATW& format) {
  CHARFORMAT2W common;
  if (!Widen(format, common)) return 0;
  const std::vector<CharFormat> formats = SelectedFormats(control);
  common = Describe(control.document, formats.front());
  for (const CharFormat& other : formats) KeepCommon(common, Describe(control.document, other));
  common.cbSize = format.cbSize;
  if (common.cbSize == sizeof(CHARFORMATW)) common.dwMask &= ~static_cast<DWORD>(CFM_BACKCOLOR);
  std::memcpy(static_cast<void*>(&format), &common, common.cbSize);
  return static_cast<LRESULT>(common.dwMask);
}

LRESULT SetCharFormat(Control& control, WPARAM which, const CHARFORMATW& format) {
  CHARFORMAT2W wanted;
  if (!Widen(format, wanted)) return FALSE;
  Document& document = control.document;
  const bool isAll = (which & SCF_ALL) != 0;
  if (!isAll && (which & SCF_SELECTION) == 0) return FALSE;
  const Span span = isAll ? Span{0, document.text.Length()} : SelectedSpan(control);
  if (span.start == span.end) control.typing = Changed(document, SelectedFormats(control).front(), wanted);
  ChangeFormats(document, span.start, span.end,
                [&](const CharFormat& before) { return Changed(document, before, wanted); });
  control.isModified = true;
  return TRUE;
}

}  // namespace platform::rich
