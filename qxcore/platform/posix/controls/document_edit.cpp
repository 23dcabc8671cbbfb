#include "qxcore/platform/posix/controls/document_edit.h"

namespace platform::rich {
namespace {

constexpr auto kKeep = [](const auto& format) { return format; };

void AddText(TextBuffer& text, std::u16string_view added) {
  if (!added.empty()) text.Add(added.data(), added.size());
}

template <class Format>
Runs<Format> Replaced(const Runs<Format>& runs, std::size_t length, std::size_t start, std::size_t end,
                      const Runs<Format>& part, std::size_t partLength) {
  Runs<Format> result;
  AppendRuns(result, runs, 0, start, 0, kKeep);
  AppendRuns(result, part, 0, partLength, start, kKeep);
  AppendRuns(result, runs, end, length, start + partLength, kKeep);
  return result;
}

}  // namespace

void CopyPart(const Document& document, std::size_t start, std::size_t end, Document& part) {
  part = Document();
  part.text.Reserve(end - start);
  AddText(part.text, document.text.View().substr(start, end - start));
  AppendRuns(part.characters, document.characters, start, end, 0, kKeep);
  AppendRuns(part.paragraphs, document.paragraphs, start, end, 0, kKeep);
  part.fonts = document.fonts;
  part.colors = document.colors;
  part.defaultFont = document.defaultFont;
}

void TakeLists(Document& document, Document& part) {
  const auto fonts = static_cast<std::int32_t>(document.fonts.size());
  const auto colors = static_cast<std::int32_t>(document.colors.size());
  const auto moved = [](std::int32_t place, std::int32_t by, std::size_t count) {
    return place >= 0 && static_cast<std::size_t>(place) < count ? place + by : CharFormat::kNone;
  };
  ChangeFormats(part, 0, part.text.Length(), [&](CharFormat format) {
    format.font = moved(format.font, fonts, part.fonts.size());
    format.color = moved(format.color, colors, part.colors.size());
    format.back = moved(format.back, colors, part.colors.size());
    return format;
  });
  document.colors.reserve(document.colors.size() + part.colors.size());
  document.fonts.insert(document.fonts.end(), part.fonts.begin(), part.fonts.end());
  document.colors.insert(document.colors.end(), part.colors.begin(), part.colors.end());
}

void ReplacePart(Document& document, std::size_t start, std::size_t end, const Document& part) {
  const std::u16string_view text = document.text.View(), added = part.text.View();
  Runs<CharFormat> characters = Replaced(document.characters, text.size(), start, end, part.characters, added.size());
  Runs<ParagraphFormat> paragraphs =
      Replaced(document.paragraphs, text.size(), start, end, part.paragraphs, added.size());
  TextBuffer joined;
  joined.Reserve(text.size() - (end - start) + added.size());
  AddText(joined, text.substr(0, start));
  AddText(joined, added);
  AddText(joined, text.substr(end));
  document.text = std::move(joined);
  document.characters.swap(characters);
  document.paragraphs.swap(paragraphs);
}

}  // namespace platform::rich
