#include "tools/common/text_source.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/system/file/file.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

int CountingInput::Read() {
  unsigned char byte;
  return Read(&byte, 1) == 1 ? byte : -1;
}

unsigned long CountingInput::Read(void* buffer, unsigned long count) {
  unsigned long got = m_inner.Read(buffer, count);
  if (m_count < sizeof m_first) {
    std::size_t wanted = std::min<std::size_t>(sizeof m_first - static_cast<std::size_t>(m_count), got);
    std::memcpy(m_first + m_count, buffer, wanted);
  }
  m_count += got;
  return got;
}

bool CountingInput::GetPlace(std::uint64_t* place) {
  *place = m_count;
  std::uint64_t inner;
  return m_inner.GetPlace(&inner) && inner == m_count;
}

bool CountingInput::GoToPlace(std::uint64_t place) {
  if (!m_inner.GoToPlace(place)) return false;
  m_count = place;
  return true;
}

bool CountingInput::StartsWith(std::string_view bytes) const {
  return m_count >= bytes.size() && std::memcmp(m_first, bytes.data(), bytes.size()) == 0;
}

namespace {

// What the system has against opening the file, after the error that it refused with.
std::string WhyNotOpened(const std::string& name, int error) {
  if (error == ENOENT) return "there is no such file";
  std::error_code ignored;
  if (std::filesystem::is_directory(console::PathOf(console::NativeOf(name)), ignored)) return "it is a folder";
  return error != 0 ? std::strerror(error) : "";
}

// The size that the file reports; 0 for none. Available would stop at 4 GiB where a long has 32 bits.
unsigned long long SizeOf(const std::string& name) {
  unsigned long low = 0, high = 0;
  if (SFile::GetSize(console::NameOf(name), low, high) < 0) return 0;
  return static_cast<unsigned long long>(high) << 32 | low;
}

}  // namespace

std::unique_ptr<SInputFile> OpenInput(const std::string& name, SProgressIndicatorEx& progress) {
  try {
    return std::make_unique<SInputFile>(console::NameOf(name), &progress);
  } catch (const SEIOCantOpenForReading& e) {
    const std::string why = WhyNotOpened(name, SGetErrorCause(e));
    throw Failure{ToUtf8(e.GetText()) + (why.empty() ? why : ": " + why)};
  }
}

TextSource::TextSource(const std::string& name, Encoding request, SProgressIndicatorEx* progress) {
  if (progress == nullptr) {
    m_bar = std::make_unique<ProgressBar>(name);
    progress = m_bar.get();
  }
  SInputStream* inner;
  if (name == "-") {
    m_standardInput = std::make_unique<StandardInput>();
    inner = m_standardInput.get();
  } else {
    m_file = OpenInput(name, *progress);
    m_size = SizeOf(name);
    inner = m_file.get();
  }
  m_bytes = std::make_unique<CountingInput>(*inner);
  m_reader = std::make_unique<SMultiFormatReaderUnicode>(*m_bytes, request);
}

void TextSource::Select() {
  try {
    m_reader->CheckFormat();
  } catch (const SEIOInvalidEncoding& e) {
    throw Failure{ToUtf8(e.GetText()) + " (" + ToUtf8(Encodings::GetEncodingName(m_reader->GetRequestedFormat())) +
                  ")"};
  }
  CheckRead();
}

bool TextSource::HasMark() {
  Encoding selected = m_reader->GetFormat();
  if (Encodings::IsSameFormat(selected, Encodings::kUTF8)) return m_bytes->StartsWith("\xEF\xBB\xBF");
  if (Encodings::IsSameFormat(selected, Encodings::kUTF16LE)) return m_bytes->StartsWith("\xFF\xFE");
  if (Encodings::IsSameFormat(selected, Encodings::kUTF16BE)) return m_bytes->StartsWith("\xFE\xFF");
  return false;
}

unsigned long long TextSource::CountBytes() {
  // Some files report no size or a wrong one; they and standard input are counted.
  if (m_size > m_bytes->Count()) return m_size;
  char skipped[65536];
  while (m_bytes->Read(skipped, sizeof skipped) != 0) {
  }
  CheckRead();
  return m_bytes->Count();
}

void TextSource::CheckRead() {
  if (int error = m_bytes->GetError()) throw Failure{std::string("Cannot be read: ") + std::strerror(error)};
}
