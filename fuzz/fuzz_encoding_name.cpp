// Names of encodings: any text is matched without harm, and what it means has a name that means the same.

#include "fuzz/fuzz_input.h"
#include "qxcore/stream/encoding/multi_format_support.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using Support = SAbstractIO::SMultiFormatSupport;
  FuzzInput input(data, size);
  int installed = input.Byte() & 1;
  SString name(ToText(input.Rest()).c_str());
  int matched = -1;
  Support::Encoding encoding = Support::MatchEncodingName(name, installed, &matched);
  FUZZ_CHECK(matched >= 0 && matched <= name.Length());
  if (encoding == 0) return 0;
  for (int withPolicy : {0, 1}) {
    SString canonical = Support::GetEncodingName(encoding, withPolicy);
    FUZZ_CHECK(!canonical.IsEmpty());
    Support::Encoding again = Support::MatchEncodingName(canonical);
    Support::Encoding mask = withPolicy != 0 ? ~Support::Encoding{0} : Support::kValueMask;
    FUZZ_CHECK((again & mask) == (encoding & mask));
  }
  Support::GetEncodingName(encoding, 1, 1, 1);
  Support::MachineSupports(encoding);
  return 0;
}
