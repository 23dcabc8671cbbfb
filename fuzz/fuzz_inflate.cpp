// The inflater and its stream, against zlib called directly on the whole input: the same bytes, and the same end.

#include <zlib.h>

#include <string>

#include "fuzz/fuzz_input.h"
#include "qxcore/core/exception.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/zip/inflater_input_stream.h"

namespace {

constexpr std::size_t kMostData = 1 << 20;

struct Outcome {
  std::string data;
  bool isFinished = false;
};

Outcome ByZlib(std::string_view bytes, bool raw) {
  Outcome outcome;
  z_stream stream = {};
  inflateInit2(&stream, raw ? -MAX_WBITS : MAX_WBITS);
  stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(bytes.data()));
  stream.avail_in = static_cast<uInt>(bytes.size());
  outcome.data.resize(kMostData);
  stream.next_out = reinterpret_cast<Bytef*>(outcome.data.data());
  stream.avail_out = static_cast<uInt>(kMostData);
  outcome.isFinished = inflate(&stream, Z_SYNC_FLUSH) == Z_STREAM_END;
  outcome.data.resize(kMostData - stream.avail_out);
  inflateEnd(&stream);
  return outcome;
}

Outcome ByInflater(std::string_view bytes, bool raw, std::size_t in, std::size_t out) {
  Outcome outcome;
  SInflater inflater(raw);
  std::string block(out, '\0');
  try {
    while (!inflater.IsFinished() && outcome.data.size() < kMostData) {
      if (inflater.GetRemaining() == 0 && !bytes.empty()) {
        const std::string_view piece = bytes.substr(0, in);
        inflater.SetInput(piece.data(), static_cast<int>(piece.size()));
        bytes.remove_prefix(piece.size());
      }
      const int got = inflater.Inflate(block.data(), static_cast<int>(block.size()));
      outcome.data.append(block, 0, static_cast<std::size_t>(got));
      if (inflater.NeedsDictionary() || (got == 0 && inflater.GetRemaining() == 0 && bytes.empty())) break;
    }
    outcome.isFinished = inflater.IsFinished();
  } catch (const SEZipException&) {
  }
  return outcome;
}

Outcome ByStream(std::string_view bytes, unsigned long in, std::size_t out) {
  Outcome outcome;
  SInputBuffer memory(bytes.data(), static_cast<unsigned long>(bytes.size()));
  SInflaterInputStream stream(memory, in);
  std::string block(out, '\0');
  try {
    while (const unsigned long got = stream.Read(block.data(), static_cast<unsigned long>(out))) {
      outcome.data.append(block, 0, got);
      if (outcome.data.size() >= kMostData) return outcome;
    }
    outcome.isFinished = stream.IsEOF() != 0;
    FUZZ_CHECK(outcome.isFinished);
  } catch (const SEZipException&) {
  }
  return outcome;
}

// Damage may be met before or after the bytes in front of it are delivered, so those are a part of the others.
void CheckSame(const Outcome& whole, const Outcome& other) {
  if (whole.data.size() >= kMostData) return;
  FUZZ_CHECK(whole.isFinished == other.isFinished);
  const bool isSame = whole.isFinished ? whole.data == other.data
                                       : whole.data.starts_with(other.data) || other.data.starts_with(whole.data);
  FUZZ_CHECK(isSame);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  const std::uint8_t way = input.Byte();
  const bool raw = (way & 1) != 0;
  const std::size_t in = std::size_t{1} + (way >> 1 & 7) * 41, out = std::size_t{1} + (way >> 4) * 299;
  const std::string_view bytes = input.Rest();
  const Outcome whole = ByZlib(bytes, raw);
  CheckSame(whole, ByInflater(bytes, raw, in, out));
  if (raw) CheckSame(whole, ByStream(bytes, static_cast<unsigned long>(in), out));
  return 0;
}
