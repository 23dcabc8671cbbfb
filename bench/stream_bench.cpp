// Single bytes out of a buffered file of 64 MB, beside std::ifstream. The file is in the page cache.

#include <filesystem>
#include <fstream>
#include <memory>

#include "bench/bench.h"
#include "bench/inputs.h"
#include "qxcore/stream/input_buffer_stream.h"
#include "qxcore/stream/input_file.h"

namespace {

constexpr unsigned long kBufferBytes = 16 << 10;

// The mixed text as a file, for as long as the program runs.
class TextFile {
 public:
  TextFile() : m_path(std::filesystem::temp_directory_path() / "qxbench-64mb.txt") {
    std::ofstream(m_path, std::ios::binary) << bench::MixedUtf8();
  }
  ~TextFile() {
    std::error_code ignored;
    std::filesystem::remove(m_path, ignored);
  }
  static const std::filesystem::path& Path() {
    static TextFile file;
    return file.m_path;
  }

 private:
  std::filesystem::path m_path;
};

BENCH("single-byte Read over a 64 MB file/ours") {
  SString path(TextFile::Path().string().c_str());
  for (auto _ : state) {
    SInputFile file(path);
    SInputBufferStream in(file, kBufferBytes);
    unsigned long sum = 0;
    for (int byte; (byte = in.Read()) >= 0;) sum += static_cast<unsigned long>(byte);
    benchmark::DoNotOptimize(sum);
  }
}

#if BENCH_PEERS

BENCH("single-byte Read over a 64 MB file/std::ifstream") {
  const auto& path = TextFile::Path();
  auto buffer = std::make_unique<char[]>(kBufferBytes);
  for (auto _ : state) {
    std::ifstream in;
    in.rdbuf()->pubsetbuf(buffer.get(), kBufferBytes);
    in.open(path, std::ios::binary);
    unsigned long sum = 0;
    for (int byte; (byte = in.get()) >= 0;) sum += static_cast<unsigned long>(byte);
    benchmark::DoNotOptimize(sum);
  }
}

#endif

}  // namespace
