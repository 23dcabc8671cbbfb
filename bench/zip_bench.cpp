// Zip archives: listing one of 60,000 entries, inflating one entry of 256 MB, and reading 20,000 small entries
// one after the other, beside libzip and minizip. All archives are in the page cache.
//
// Every side opens the archive, takes name, sizes, CRC and time of each entry it lists, checks the CRC of
// what it reads, and reads large data a megabyte at a time. The texts are words of a made-up language and
// shrink to about a third.

#include <zlib.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <functional>
#include <random>
#include <string>
#include <vector>

#if BENCH_PEERS
#include <minizip/unzip.h>
#include <zip.h>
#endif

#include "bench/bench.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/zip/zip_file.h"
#include "qxcore/stream/zip/zip_input_stream.h"

namespace {

constexpr std::size_t kLargePiece = 64 << 20;
constexpr int kLargePieces = 4;
constexpr std::size_t kReadBytes = 1 << 20;

std::string Words(std::size_t bytes, unsigned seed) {
  std::mt19937 random(seed);
  std::vector<std::string> words(4000);
  for (std::string& word : words) {
    for (unsigned length = 2 + random() % 9; length > 0; --length) word += static_cast<char>('a' + random() % 26);
  }
  std::string text;
  while (text.size() < bytes) {
    // Two numbers, of which the smaller counts, make some words frequent.
    text += words[std::min(random() % words.size(), random() % words.size())];
    text += random() % 12 == 0 ? '\n' : ' ';
  }
  text.resize(bytes);
  return text;
}

std::string Deflate(const std::string& text, int pieces) {
  z_stream stream = {};
  deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, -MAX_WBITS, 8, Z_DEFAULT_STRATEGY);
  std::string piece(deflateBound(&stream, static_cast<uLong>(text.size())) + 64, '\0'), all;
  const auto take = [&](int flush) {
    stream.next_out = reinterpret_cast<Bytef*>(piece.data());
    stream.avail_out = static_cast<uInt>(piece.size());
    deflate(&stream, flush);
    return piece.substr(0, piece.size() - stream.avail_out);
  };
  stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(text.data()));
  stream.avail_in = static_cast<uInt>(text.size());
  // After a full flush the blocks stand for themselves and can be repeated.
  const std::string blocks = take(Z_FULL_FLUSH);
  for (int i = 0; i < pieces; ++i) all += blocks;
  all += take(Z_FINISH);
  deflateEnd(&stream);
  return all;
}

std::string Number(std::uint64_t value, int bytes) {
  std::string text;
  for (int i = 0; i < bytes; ++i) text += static_cast<char>(value >> (8 * i));
  return text;
}

// Writes an archive as a file, for as long as the program runs.
class ArchiveFile {
 public:
  ArchiveFile(const char* name, const std::function<void(ArchiveFile&)>& fill)
      : m_path(std::filesystem::temp_directory_path() / name), m_out(m_path, std::ios::binary) {
    fill(*this);
    m_out << m_directory
          << "PK\5\6" + Number(0, 4) + Number(m_count, 2) + Number(m_count, 2) + Number(m_directory.size(), 4) +
                 Number(m_offset, 4) + Number(0, 2);
    m_out.close();
  }
  ~ArchiveFile() {
    std::error_code ignored;
    std::filesystem::remove(m_path, ignored);
  }

  void Add(const std::string& name, const std::string& text, int pieces = 1) {
    const std::string data = Deflate(text, pieces);
    uLong crc = 0;
    for (int i = 0; i < pieces; ++i)
      crc = crc32(crc, reinterpret_cast<const Bytef*>(text.data()), static_cast<uInt>(text.size()));
    const std::string fields = Number(20, 2) + Number(0, 2) + Number(8, 2) + Number(0x5D756C5A, 4) + Number(crc, 4) +
                               Number(data.size(), 4) + Number(text.size() * static_cast<std::size_t>(pieces), 4) +
                               Number(name.size(), 2) + Number(0, 2);
    m_directory += "PK\1\2" + Number(20, 2) + fields + Number(0, 10) + Number(m_offset, 4) + name;
    m_out << "PK\3\4" << fields << name << data;
    m_offset += 30 + name.size() + data.size();
    ++m_count;
  }

  std::string Path() const { return m_path.string(); }
  SString LibraryPath() const { return SString(Path().c_str()); }

 private:
  std::filesystem::path m_path;
  std::ofstream m_out;
  std::string m_directory;
  std::uint64_t m_offset = 0, m_count = 0;
};

const ArchiveFile& Many() {
  static const ArchiveFile archive("qxbench-many.zip", [](ArchiveFile& file) {
    for (int i = 0; i < 60000; ++i)
      file.Add("folder" + std::to_string(i % 300) + "/sub folder/file number " + std::to_string(i) + ".txt", "x");
  });
  return archive;
}

const ArchiveFile& Large() {
  static const ArchiveFile archive(
      "qxbench-large.zip", [](ArchiveFile& file) { file.Add("large.txt", Words(kLargePiece, 1), kLargePieces); });
  return archive;
}

const ArchiveFile& Small() {
  static const ArchiveFile archive("qxbench-small.zip", [](ArchiveFile& file) {
    const std::string text = Words(1 << 20, 2);
    for (std::size_t i = 0; i < 20000; ++i)
      file.Add("folder/file" + std::to_string(i) + ".txt", text.substr(i * 50, 100 + i % 900));
  });
  return archive;
}

// All data of all entries; a wrong CRC is a failure of the benchmark.
void ReadInSequence(benchmark::State& state, const ArchiveFile& archive) {
  const SString path = archive.LibraryPath();
  std::vector<char> data(kReadBytes);
  for (auto _ : state) {
    SInputFile file(path);
    SZipInputStream zip(file);
    while (const SZipEntry* entry = zip.GetNextEntry()) {
      while (zip.Read(data.data(), static_cast<unsigned long>(data.size())) != 0) {
      }
      if (zip.GetCRC() != entry->GetCRC()) std::abort();
    }
  }
}

BENCH("list a zip archive of 60,000 entries/ours") {
  const SString path = Many().LibraryPath();
  for (auto _ : state) {
    SZipFile zip(path);
    std::uint64_t sum = 0;
    for (int found = zip.FindFile(WTEXT("*"), ~0ul); found != 0; found = zip.FindNextFile()) {
      const SZipEntry& entry = zip.GetEntry();
      sum += static_cast<std::uint64_t>(entry.GetName().Length() + entry.GetSize() + entry.GetCompressedSize() +
                                        entry.GetCRC()) +
             entry.GetTime().dwLowDateTime;
    }
    benchmark::DoNotOptimize(sum);
  }
}

BENCH("inflate a zip entry of 256 MB/ours") { ReadInSequence(state, Large()); }
BENCH("read 20,000 small zip entries in sequence/ours") { ReadInSequence(state, Small()); }

#if BENCH_PEERS

BENCH("list a zip archive of 60,000 entries/libzip") {
  const std::string path = Many().Path();
  for (auto _ : state) {
    zip_t* zip = zip_open(path.c_str(), ZIP_RDONLY, nullptr);
    std::uint64_t sum = 0;
    const zip_int64_t count = zip_get_num_entries(zip, 0);
    for (zip_int64_t i = 0; i < count; ++i) {
      zip_stat_t entry;
      zip_stat_index(zip, static_cast<zip_uint64_t>(i), 0, &entry);
      sum += std::char_traits<char>::length(entry.name) + entry.size + entry.comp_size + entry.crc +
             static_cast<std::uint64_t>(entry.mtime);
    }
    benchmark::DoNotOptimize(sum);
    zip_discard(zip);
  }
}

BENCH("list a zip archive of 60,000 entries/minizip") {
  const std::string path = Many().Path();
  for (auto _ : state) {
    unzFile zip = unzOpen64(path.c_str());
    std::uint64_t sum = 0;
    for (int result = unzGoToFirstFile(zip); result == UNZ_OK; result = unzGoToNextFile(zip)) {
      unz_file_info64 entry;
      char name[300];
      unzGetCurrentFileInfo64(zip, &entry, name, sizeof name, nullptr, 0, nullptr, 0);
      sum += std::char_traits<char>::length(name) + entry.uncompressed_size + entry.compressed_size + entry.crc +
             static_cast<std::uint64_t>(entry.tmu_date.tm_sec);
    }
    benchmark::DoNotOptimize(sum);
    unzClose(zip);
  }
}

BENCH("inflate a zip entry of 256 MB/libzip") {
  const std::string path = Large().Path();
  std::vector<char> data(kReadBytes);
  for (auto _ : state) {
    zip_t* zip = zip_open(path.c_str(), ZIP_RDONLY, nullptr);
    zip_file_t* file = zip_fopen_index(zip, 0, 0);
    zip_int64_t got = 0, sum = 0;
    while ((got = zip_fread(file, data.data(), data.size())) > 0) sum += got;
    if (got < 0 || sum != static_cast<zip_int64_t>(kLargePiece * kLargePieces)) std::abort();
    zip_fclose(file);
    zip_discard(zip);
  }
}

BENCH("read 20,000 small zip entries in sequence/minizip") {
  const std::string path = Small().Path();
  std::vector<char> data(kReadBytes);
  for (auto _ : state) {
    unzFile zip = unzOpen64(path.c_str());
    for (int result = unzGoToFirstFile(zip); result == UNZ_OK; result = unzGoToNextFile(zip)) {
      unz_file_info64 entry;
      char name[300];
      unzGetCurrentFileInfo64(zip, &entry, name, sizeof name, nullptr, 0, nullptr, 0);
      unzOpenCurrentFile(zip);
      while (unzReadCurrentFile(zip, data.data(), static_cast<unsigned>(data.size())) > 0) {
      }
      if (unzCloseCurrentFile(zip) != UNZ_OK) std::abort();  // also says whether the CRC is right
    }
    unzClose(zip);
  }
}

#endif

}  // namespace
