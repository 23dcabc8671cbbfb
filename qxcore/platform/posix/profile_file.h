// The lines of an initialisation file, and what they say.
//
// Lines that are not changed keep their bytes, whatever these are. A file that begins with the mark of
// UTF-16 (either byte order) or UTF-8 is read in that encoding, every other one in the ANSI code page.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "qxcore/platform/win32.h"

namespace platform {

class ProfileFile {
 public:
  // An empty content is that of a new file.
  explicit ProfileFile(std::string bytes);

  // The value of a key, blanks around it and one pair of quotation marks removed. False when there is none.
  bool Find(std::u16string_view section, std::u16string_view key, std::u16string& value) const;
  // In the order of the file; a section that occurs twice is named twice, though only the first one counts. The
  // section without a name, which is what stands before all others, is left out.
  std::vector<std::u16string> Sections() const;
  std::vector<std::u16string> Keys(std::u16string_view section) const;

  // Behind the section's last key, or in the key's place, keeping its spelling. False when nothing changes.
  bool Set(std::u16string_view section, std::u16string_view key, std::u16string_view value);
  bool DeleteKey(std::u16string_view section, std::u16string_view key);
  bool DeleteSection(std::u16string_view section);

  std::string Bytes() const;

 private:
  enum class Encoding { kAnsi, kUtf8, kUtf16, kReversedUtf16 };
  enum class Kind { kOther, kBlank, kSection, kKey };
  struct Line {
    std::string bytes;  // with the line end
    Kind kind = Kind::kOther;
    std::u16string name;         // of the section or the key
    std::u16string value;        // as it stands there
    std::u16string beforeValue;  // the key, the sign and the blanks around it
  };

  void SplitLines(std::string_view bytes);
  Line MakeLine(std::string_view bytes) const;
  Line MakeLine(const std::u16string& text) const;  // with this file's line end
  std::u16string Decode(std::string_view bytes) const;
  std::string Encode(std::u16string_view text) const;
  static constexpr std::size_t kTop = static_cast<std::size_t>(-1);  // the line before the first one
  // Index of the key's line; the number of lines when there is none.
  std::size_t FindKey(std::u16string_view section, std::u16string_view key) const;
  // Of its header; kTop for the section without a name.
  std::size_t FindSection(std::u16string_view section) const;
  std::size_t EndOfSection(std::size_t header) const;
  void EndLastLine();

  Encoding m_encoding = Encoding::kAnsi;
  std::string m_mark;
  std::string m_lineEnd;
  std::vector<Line> m_lines;
};

}  // namespace platform
