// Detection with every request: any bytes are read without harm, and neither the text nor the choice
// depends on how the source hands out its bytes or how the reader is read.

#include "fuzz/fuzz_input.h"
#include "fuzz/pieces.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using Support = SAbstractIO::SMultiFormatSupport;
  FuzzInput input(data, size);
  auto requested = input.Number<std::uint32_t>();
  // Mostly requests that mean something: kind and code page from a list, the policy as it is.
  constexpr Support::Encoding kValues[] = {Support::kANSI,         Support::kASCII,       Support::kOEM,
                                           Support::kUTF8,         Support::kUTF16LE,     Support::kUTF16BE,
                                           Support::kANSI | 1252,  Support::kANSI | 932,  Support::kANSI | 936,
                                           Support::kANSI | 949,   Support::kANSI | 1251, Support::kANSI | 54936,
                                           Support::kANSI | 50220, Support::kUTF8 | 0x8,  Support::kUTF16LE | 0x18,
                                           Support::kUTF16BE | 0x8};
  if ((requested & 0x80000000) == 0) {
    requested = (requested & Support::kFlagsMask & 0x7FFFFFFF) | kValues[requested & 15];
  }
  std::uint8_t way = input.Byte();
  unsigned long repeat = (way & 0x40) != 0 ? 4096 : 0;  // behind that many bytes of ASCII
  std::string bytes = std::string(repeat, 'a') + std::string(input.Rest());
  int quick = way >> 7;
  Outcome whole = ReadAll(bytes, 0, requested, 4096, quick, -1);
  CheckSame(whole, ReadAll(bytes, 1 + (way & 7), requested, 1 + (way >> 3 & 7), quick, -1), "reading in small pieces");
  CheckSame(whole, ReadAll(bytes, 4095, requested, 0, quick, -1), "reading by character");
  return 0;
}
