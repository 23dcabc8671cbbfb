// Texts of 64 MB that the benchmarks of streams and encodings read.
//
// "Mixed UTF-8" repeats sentences in English, German, French, Polish, Russian, Greek, Chinese and
// Japanese, with the shares that the sentences have by themselves: of its bytes about half are
// ASCII, of its characters two thirds; the others take two bytes (accents, Cyrillic, Greek) or three (Chinese and
// Japanese). "windows-1252" repeats the English, German and French ones, "Shift-JIS" the English and
// Japanese ones. Four-byte sequences do not occur.
#pragma once

#include <cstddef>
#include <string>

namespace bench {

inline constexpr std::size_t kInputBytes = 64 << 20;
inline constexpr std::size_t kPieceBytes = 64 << 10;  // what a reader is asked for at a time

// Each made on first use, and exactly kInputBytes long but for the last sentence.
const std::string& Ascii();
const std::string& MixedUtf8();
const std::string& Utf16();  // the characters of the mixed text, little-endian, without a mark
const std::string& Windows1252();
const std::string& ShiftJis();

}  // namespace bench
