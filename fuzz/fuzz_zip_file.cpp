// The reader of the central directory: any file is listed or refused without harm, twice in the same way, and
// what is extracted has the size and the checksum that the directory tells.

#include <unistd.h>

#include <fstream>
#include <string>

#include "fuzz/fuzz_input.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/output_stream.h"
#include "qxcore/stream/zip/crc32.h"
#include "qxcore/stream/zip/zip_file.h"

namespace {

constexpr int kMostExtracted = 4;

struct TooMuch {};

class CheckingOutput : public SOutputStream {
 public:
  void Write(int byte) override {
    const auto one = static_cast<unsigned char>(byte);
    Write(&one, 1);
  }
  unsigned long Write(const void* bytes, unsigned long count) override {
    m_crc.Update(bytes, count);
    m_count += count;
    if (m_count > 1 << 22) throw TooMuch();
    return count;
  }
  bool Is(const SZipEntry& entry) const {
    return static_cast<std::int64_t>(m_count) == entry.GetSize() && m_crc.GetValue() == entry.GetCRC();
  }

 private:
  SCRC32 m_crc;
  std::uint64_t m_count = 0;
};

void Extract(const SString& path, const SZipEntry& entry) {
  CheckingOutput out;
  try {
    SZipFile::ExtractTo(path, entry.GetName(), out);
    // The first entry of this name was taken, which may be another one.
    SZipFile again(path);
    for (int found = again.FindFile(nullptr, 0); found; found = again.FindNextFileW()) {
      if (again.GetEntry().GetName() != entry.GetName()) continue;
      FUZZ_CHECK(out.Is(again.GetEntry()));
      return;
    }
    FUZZ_CHECK(false);
  } catch (const SEZipException&) {
  } catch (const SEEOFException&) {
  } catch (const TooMuch&) {
  }
}

void Read(const SString& path) {
  try {
    SZipFile zip(path);
    unsigned long count = 0;
    int extracted = 0;
    for (int found = zip.FindFile(nullptr, 0); found; found = zip.FindNextFileW(), ++count) {
      if (extracted++ < kMostExtracted) Extract(path, zip.GetEntry());
    }
    FUZZ_CHECK(zip.HasFailed() ? count < zip.GetCount() : count == zip.GetCount());
  } catch (const SEZipException&) {
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const std::string name = "/dev/shm/qxcore-fuzz-" + std::to_string(getpid()) + ".zip";
  static const SString path(name.c_str());
  std::ofstream(name, std::ios::binary).write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
  Read(path);
  unlink(name.c_str());
  return 0;
}
