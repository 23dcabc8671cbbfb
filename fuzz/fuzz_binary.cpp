// The binary format: any bytes are read without harm and without much memory; what was read is written and
// read again the same.

#include "fuzz/fuzz_input.h"
#include "qxcore/core/exception.h"
#include "qxcore/stream/input_binary_stream.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/output_binary_stream.h"
#include "qxcore/stream/output_global.h"

namespace {

template <class Value>
bool IsSame(const Value& a, const Value& b) {
  return a == b;
}

template <class Value>
void RoundTrip(std::string_view bytes) {
  Value value;
  try {
    SInputBuffer memory(bytes.data(), static_cast<unsigned long>(bytes.size()));
    SInputBinaryStream in(memory);
    in >> value;
  } catch (const SException&) {
    // What was read so far goes the way as well.
  }
  SOutputGlobal written;
  SOutputBinaryStream out(written);
  out << value;
  SInputBuffer memory(written.GetData(), written.UsedSize());
  SInputBinaryStream in(memory);
  Value back;
  in >> back;
  FUZZ_CHECK(IsSame(value, back));
  FUZZ_CHECK(memory.Available() == 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  const std::uint8_t kind = input.Byte();
  const std::string_view bytes = input.Rest();
  switch (kind % 6) {
    case 0:
      RoundTrip<SString>(bytes);
      break;
    case 1:
      RoundTrip<SStringTable>(bytes);
      break;
    case 2:
      RoundTrip<SStringMap>(bytes);
      break;
    case 3:
      RoundTrip<SStringMapNoCase>(bytes);
      break;
    case 4:
      RoundTrip<SStringUnsortedMap>(bytes);
      break;
    default:
      RoundTrip<SStringUnsortedMapNoCase>(bytes);
  }
  return 0;
}
