#include "qxcore/platform/posix/profile_file.h"

#include "qxcore/platform/bmp.h"

namespace platform {
namespace {

using View = std::u16string_view;

bool IsBlank(char16_t c) { return c == ' ' || c == '\t' || c == '\v' || c == '\f' || c == '\r' || c == '\n'; }

View Trim(View text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
  while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
  return text;
}

bool IsSame(View a, View b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i)
    if (ToUpperBmp(a[i]) != ToUpperBmp(b[i])) return false;
  return true;
}

View WithoutQuotes(View text) {
  const bool isQuoted =
      text.size() >= 2 && (text.front() == '"' || text.front() == '\'') && text.back() == text.front();
  return isQuoted ? text.substr(1, text.size() - 2) : text;
}

bool StartsWith(const std::string& bytes, std::string_view mark) { return bytes.compare(0, mark.size(), mark) == 0; }

}  // namespace

ProfileFile::ProfileFile(std::string bytes) {
  using namespace std::string_view_literals;
  if (StartsWith(bytes, "\xFF\xFE"sv)) m_encoding = Encoding::kUtf16, m_mark = bytes.substr(0, 2);
  if (StartsWith(bytes, "\xFE\xFF"sv)) m_encoding = Encoding::kReversedUtf16, m_mark = bytes.substr(0, 2);
  if (StartsWith(bytes, "\xEF\xBB\xBF"sv)) m_encoding = Encoding::kUtf8, m_mark = bytes.substr(0, 3);
  SplitLines(std::string_view(bytes).substr(m_mark.size()));
  if (m_lineEnd.empty()) m_lineEnd = Encode(u"\r\n");
}

// A carriage return, a line feed or both end a line.
void ProfileFile::SplitLines(std::string_view bytes) {
  const std::size_t unit = m_encoding == Encoding::kUtf16 || m_encoding == Encoding::kReversedUtf16 ? 2 : 1;
  const std::size_t low = m_encoding == Encoding::kReversedUtf16 ? 1 : 0;
  const auto isAt = [&](std::size_t at, char c) {
    return at + unit <= bytes.size() && bytes[at + low] == c && (unit == 1 || bytes[at + 1 - low] == 0);
  };
  while (!bytes.empty()) {
    std::size_t end = 0;
    while (end < bytes.size() && !isAt(end, '\r') && !isAt(end, '\n')) end += unit;
    std::size_t next = end;
    if (isAt(next, '\r')) next += unit;
    if (isAt(next, '\n')) next += unit;
    next = next < bytes.size() ? next : bytes.size();
    if (m_lineEnd.empty() && next > end) m_lineEnd = bytes.substr(end, next - end);
    m_lines.push_back(MakeLine(bytes.substr(0, next)));
    bytes.remove_prefix(next);
  }
}

ProfileFile::Line ProfileFile::MakeLine(std::string_view bytes) const {
  Line line;
  line.bytes = bytes;
  const std::u16string decoded = Decode(bytes);
  const View text = Trim(decoded);
  if (text.empty()) {
    line.kind = Kind::kBlank;
  } else if (text.front() == '[') {
    const std::size_t end = text.rfind(']');
    if (end == View::npos) return line;
    line.kind = Kind::kSection;
    line.name = Trim(text.substr(1, end - 1));
  } else if (text.front() != ';') {
    const std::size_t sign = text.find('=');
    if (sign == View::npos) return line;
    line.kind = Kind::kKey;
    line.name = Trim(text.substr(0, sign));
    line.value = Trim(text.substr(sign + 1));
    std::size_t value = decoded.find('=') + 1;
    while (value < decoded.size() && (decoded[value] == ' ' || decoded[value] == '\t')) ++value;
    line.beforeValue = decoded.substr(0, value);
  }
  return line;
}

ProfileFile::Line ProfileFile::MakeLine(const std::u16string& text) const { return MakeLine(Encode(text) + m_lineEnd); }

std::u16string ProfileFile::Decode(std::string_view bytes) const {
  std::u16string text;
  if (m_encoding == Encoding::kUtf16 || m_encoding == Encoding::kReversedUtf16) {
    const std::size_t low = m_encoding == Encoding::kUtf16 ? 0 : 1;
    for (std::size_t at = 0; at + 2 <= bytes.size(); at += 2)
      text += static_cast<char16_t>(static_cast<unsigned char>(bytes[at + low]) |
                                    static_cast<unsigned char>(bytes[at + 1 - low]) << 8);
    return text;
  }
  text.resize(bytes.size());
  const int length = MultiByteToWideChar(m_encoding == Encoding::kUtf8 ? CP_UTF8 : CP_ACP, 0, bytes.data(),
                                         static_cast<int>(bytes.size()), text.data(), static_cast<int>(text.size()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

std::string ProfileFile::Encode(std::u16string_view text) const {
  std::string bytes;
  if (m_encoding == Encoding::kUtf16 || m_encoding == Encoding::kReversedUtf16) {
    for (const char16_t c : text) {
      const char low = static_cast<char>(c & 0xFF), high = static_cast<char>(c >> 8);
      bytes += m_encoding == Encoding::kUtf16 ? low : high;
      bytes += m_encoding == Encoding::kUtf16 ? high : low;
    }
    return bytes;
  }
  const UINT page = m_encoding == Encoding::kUtf8 ? CP_UTF8 : CP_ACP;
  const int count = static_cast<int>(text.size());
  bytes.resize(text.size() * 4);
  const int length =
      WideCharToMultiByte(page, 0, text.data(), count, bytes.data(), static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

// --- what the lines say ---

// The first of the name; others stay unseen. What stands before all sections is the one without a name.
std::size_t ProfileFile::FindSection(View section) const {
  if (section.empty()) return kTop;
  std::size_t header = 0;
  while (header < m_lines.size() && !(m_lines[header].kind == Kind::kSection && IsSame(m_lines[header].name, section)))
    ++header;
  return header;
}

std::size_t ProfileFile::EndOfSection(std::size_t header) const {
  std::size_t end = header + 1;
  while (end < m_lines.size() && m_lines[end].kind != Kind::kSection) ++end;
  return end;
}

std::size_t ProfileFile::FindKey(View section, View key) const {
  const std::size_t header = FindSection(section), end = EndOfSection(header);
  for (std::size_t i = header + 1; i < end; ++i)
    if (m_lines[i].kind == Kind::kKey && IsSame(m_lines[i].name, key)) return i;
  return m_lines.size();
}

bool ProfileFile::Find(View section, View key, std::u16string& value) const {
  const std::size_t line = FindKey(Trim(section), Trim(key));
  if (line == m_lines.size()) return false;
  value = WithoutQuotes(m_lines[line].value);
  return true;
}

std::vector<std::u16string> ProfileFile::Sections() const {
  std::vector<std::u16string> names;
  for (const Line& line : m_lines)
    if (line.kind == Kind::kSection && !line.name.empty()) names.push_back(line.name);
  return names;
}

std::vector<std::u16string> ProfileFile::Keys(View section) const {
  section = Trim(section);
  std::vector<std::u16string> names;
  const std::size_t header = FindSection(section), end = EndOfSection(header);
  for (std::size_t i = header + 1; i < end; ++i)
    if (m_lines[i].kind == Kind::kKey) names.push_back(m_lines[i].name);
  return names;
}

// --- changes ---

bool ProfileFile::Set(View section, View key, View value) {
  section = Trim(section);
  key = Trim(key);
  const std::size_t found = FindKey(section, key);
  if (found < m_lines.size()) {
    if (m_lines[found].value == value) return false;
    m_lines[found] = MakeLine(m_lines[found].beforeValue + std::u16string(value));
    return true;
  }
  const Line added = MakeLine(std::u16string(key) + u'=' + std::u16string(value));
  std::size_t header = FindSection(section);
  if (header == m_lines.size()) {
    EndLastLine();
    m_lines.push_back(MakeLine(u'[' + std::u16string(section) + u']'));
  }
  std::size_t at = EndOfSection(header);
  while (at > header + 1 && m_lines[at - 1].kind == Kind::kBlank) --at;
  if (at == m_lines.size()) EndLastLine();
  m_lines.insert(m_lines.begin() + static_cast<std::ptrdiff_t>(at), added);
  return true;
}

bool ProfileFile::DeleteKey(View section, View key) {
  const std::size_t found = FindKey(Trim(section), Trim(key));
  if (found == m_lines.size()) return false;
  m_lines.erase(m_lines.begin() + static_cast<std::ptrdiff_t>(found));
  return true;
}

bool ProfileFile::DeleteSection(View section) {
  const std::size_t header = FindSection(Trim(section));
  if (header == m_lines.size()) return false;
  const std::size_t first = header == kTop ? 0 : header;
  if (first == EndOfSection(header)) return false;
  m_lines.erase(m_lines.begin() + static_cast<std::ptrdiff_t>(first),
                m_lines.begin() + static_cast<std::ptrdiff_t>(EndOfSection(header)));
  return true;
}

// So that another line can follow.
void ProfileFile::EndLastLine() {
  if (m_lines.empty()) return;
  std::string& bytes = m_lines.back().bytes;
  // Half a character could not be followed by anything.
  const bool isWide = m_encoding == Encoding::kUtf16 || m_encoding == Encoding::kReversedUtf16;
  if (isWide && bytes.size() % 2 != 0) bytes.pop_back();
  const std::u16string text = Decode(bytes);
  if (!text.empty() && text.back() != '\n' && text.back() != '\r') bytes += m_lineEnd;
}

std::string ProfileFile::Bytes() const {
  std::string bytes = m_mark;
  for (const Line& line : m_lines) bytes += line.bytes;
  return bytes;
}

}  // namespace platform
