// What a reader keeps behind one pointer: its input, the choice of the format, and the decoder.
#pragma once

#include <cstdint>

#include "qxcore/core/memory.h"
#include "qxcore/stream/encoding/internal/data_affinity.h"
#include "qxcore/stream/encoding/internal/format_check.h"
#include "qxcore/stream/encoding/internal/raw_input.h"
#include "qxcore/stream/encoding/internal/text_decoder.h"

struct SReaderState {
  explicit SReaderState(SRawInput::Buffer& buffer) : raw(buffer) {}

  // Through the library's memory, like everything.
  static void* operator new(std::size_t size) { return SMemAlloc(size); }
  static void operator delete(void* block) { SMemFree(block); }

  SRawInput raw;
  SFormatChoice choice;
  STextDecoder decoder;     // of the selected encoding; counts the losses
  SEncodingGuess guess;     // what the library's own GuessEncoding made of the evidence last
  bool isComplete = false;  // the evidence is that of the whole input
  SSamplePlace samplePlace = SSamplePlace::kBeginning;  // of the sample that is scored

  // Where a lossless decoder that needs the whole input met what it cannot map: it keeps a state, and so cannot be
  // asked again from there.
  static constexpr std::uint64_t kNowhere = ~std::uint64_t{0};
  std::uint64_t loss = kNowhere;
};
