// The sequential reader of archives: any bytes are read or refused without harm, and what comes out does not
// depend on how the source hands out its bytes or how large the reads are.

#include <string>

#include "fuzz/fuzz_input.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/zip/zip_input_stream.h"

namespace {

constexpr std::size_t kMostData = 1 << 22;

// Gives at most so many bytes at a time.
class SlowSource : public SInputBuffer {
 public:
  SlowSource(std::string_view bytes, unsigned long most)
      : SInputBuffer(bytes.data(), static_cast<unsigned long>(bytes.size())), m_most(most) {}
  using SInputBuffer::Read;
  unsigned long Read(void* buffer, unsigned long count) override {
    return SInputBuffer::Read(buffer, count < m_most ? count : m_most);
  }

 private:
  unsigned long m_most;
};

// Everything that was read, or that it was refused.
std::string ReadArchive(std::string_view bytes, unsigned long source, unsigned long piece) {
  SlowSource in(bytes, source);
  SZipInputStream zip(in);
  std::string all, data(piece, '\0');
  const auto append = [&all](SStringView text) {
    all.append(reinterpret_cast<const char*>(text.data()), text.size() * sizeof(WCHAR));
  };
  try {
    while (const SZipEntry* entry = zip.GetNextEntry()) {
      append(entry->GetName());
      const std::size_t begin = all.size();
      // Not by the count of the last read, which ends with an entry's end but not with kMostData.
      while (const unsigned long got = zip.Read(data.data(), piece)) {
        all.append(data, 0, got);
        if (all.size() > kMostData) return "too much";
      }
      FUZZ_CHECK(zip.IsEOF());
      FUZZ_CHECK(entry->GetSize() == static_cast<std::int64_t>(all.size() - begin));
      FUZZ_CHECK(zip.GetPosition() <= static_cast<std::int64_t>(bytes.size()));
    }
    return all + "end";
  } catch (const SEZipException&) {
    // Which of two faults is met first depends on the reads; that there is one does not.
    return "refused";
  } catch (const SEEOFException&) {
    return "refused";
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  const std::string whole = ReadArchive(bytes, ~0ul, 1 << 16);
  const std::string pieces = ReadArchive(bytes, 7, 300);
  if (whole != "too much" && pieces != "too much") FUZZ_CHECK(whole == pieces);
  return 0;
}
