// Makes zip archives in memory, sound ones and ones with a chosen fault.
#pragma once

#include <zlib.h>

#include <cstdint>
#include <string>
#include <vector>

namespace test {

inline std::string Number(std::uint64_t value, int bytes) {
  std::string text;
  for (int i = 0; i < bytes; ++i) text += static_cast<char>(value >> (8 * i));
  return text;
}

// Deflate data, raw (-15) or wrapped (15).
inline std::string Deflate(const std::string& data, int windowBits = -15, const std::string& dictionary = "") {
  z_stream stream = {};
  deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, windowBits, 8, Z_DEFAULT_STRATEGY);
  if (!dictionary.empty())
    deflateSetDictionary(&stream, reinterpret_cast<const Bytef*>(dictionary.data()),
                         static_cast<uInt>(dictionary.size()));
  std::string out(deflateBound(&stream, static_cast<uLong>(data.size())) + 64, '\0');
  stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(data.data()));
  stream.avail_in = static_cast<uInt>(data.size());
  stream.next_out = reinterpret_cast<Bytef*>(out.data());
  stream.avail_out = static_cast<uInt>(out.size());
  deflate(&stream, Z_FINISH);
  out.resize(stream.total_out);
  deflateEnd(&stream);
  return out;
}

// One entry; what a header says can be set to something else than what is true.
struct ZipPart {
  ZipPart(std::string entryName, std::string content, bool deflated = true)
      : name(std::move(entryName)), method(deflated ? 8 : 0), data(deflated ? Deflate(content) : content) {
    crc = static_cast<std::uint32_t>(
        crc32(0, reinterpret_cast<const Bytef*>(content.data()), static_cast<uInt>(content.size())));
    compressedSize = data.size();
    size = content.size();
  }

  std::string Local() const {
    const bool later = (flags & 8) != 0;
    std::string header = Number(0x04034B50, 4) + Number(20, 2) + Number(flags, 2) + Number(method, 2) +
                         Number(time, 2) + Number(date, 2);
    header += Number(later ? 0 : crc, 4) + Number(later ? 0 : compressedSize, 4) + Number(later ? 0 : size, 4);
    header += Number(name.size(), 2) + Number(extra.size(), 2) + name + extra + data;
    if (later) header += Number(descriptor, 4) + Number(crc, 4) + Number(compressedSize, 4) + Number(size, 4);
    return header;
  }
  std::string Central(std::uint64_t offset) const {
    return Number(centralSignature, 4) + Number(20, 2) + Number(20, 2) + Number(flags, 2) + Number(method, 2) +
           Number(time, 2) + Number(date, 2) + Number(crc, 4) + Number(compressedSize, 4) + Number(size, 4) +
           Number(name.size(), 2) + Number(extra.size(), 2) + Number(comment.size(), 2) + Number(0, 8) +
           Number(offset, 4) + name + extra + comment;
  }

  std::string name, comment, extra;
  unsigned method, flags = 0, date = 0x5D75, time = 0x6C5A;  // 21 November 2026, 13:34:52
  std::uint32_t crc;
  std::uint64_t compressedSize, size;
  std::uint32_t centralSignature = 0x02014B50, descriptor = 0x08074B50;
  std::string data;
};

// A whole archive. The fields of the END record are added to what is true.
struct ZipBuilder {
  std::vector<ZipPart> parts;
  std::string comment, behindLocal;
  int moreEntries = 0, moreOnDisk = 0, longer = 0, further = 0, behindComment = 0;

  std::string Locals() const {
    std::string all;
    for (const ZipPart& part : parts) all += part.Local();
    return all + behindLocal;
  }
  std::string Make() const {
    std::string all, directory;
    for (const ZipPart& part : parts) {
      directory += part.Central(all.size());
      all += part.Local();
    }
    all += behindLocal;
    const std::uint64_t offset = all.size();
    return all + directory +
           End(directory.size() + static_cast<std::uint64_t>(longer), offset + static_cast<std::uint64_t>(further));
  }
  std::string End(std::uint64_t length, std::uint64_t offset) const {
    const auto count = static_cast<std::uint64_t>(static_cast<int>(parts.size()) + moreEntries);
    return Number(0x06054B50, 4) + Number(0, 4) + Number(count + static_cast<std::uint64_t>(moreOnDisk), 2) +
           Number(count, 2) + Number(length, 4) + Number(offset, 4) +
           Number(comment.size() + static_cast<std::uint64_t>(behindComment), 2) + comment;
  }
};

}  // namespace test
