// Formatting: conversions with all flags, widths and precisions, each with an argument of its type;
// integers and texts beside the C library, floating point for its length and its harmlessness.

#include <cstdarg>

#include "fuzz/fuzz_input.h"
#include "qxcore/string/string.h"

namespace {

SString Format(const WCHAR* format, ...) {
  SString text;
  std::va_list arguments;
  va_start(arguments, format);
  text.FormatV(format, arguments);
  va_end(arguments);
  return text;
}

std::string Narrow(const SString& text) {
  std::string narrow;
  for (WCHAR c : text.View()) narrow += c < 0x80 ? static_cast<char>(c) : '?';
  return narrow;
}

struct Conversion {
  std::string flags;    // flags, width and precision
  bool isPlain = true;  // means the same to the C library

  explicit Conversion(FuzzInput& input) {
    std::uint8_t bits = input.Byte();
    for (int i = 0; i < 5; ++i) {
      if ((bits >> i & 1) != 0) flags += "-+ #0"[i];
    }
    if ((bits & 0x20) != 0) flags += std::to_string(input.Number<std::uint16_t>() % ((bits & 0x80) != 0 ? 2000 : 40));
    if ((bits & 0x40) != 0)
      flags += "." + std::to_string(input.Number<std::uint16_t>() % ((bits & 0x80) != 0 ? 2000 : 40));
  }
};

template <class... Arguments>
std::string Expected(const std::string& format, Arguments... arguments) {
  std::string text(8192, 0);
  int length = std::snprintf(text.data(), text.size(), format.c_str(), arguments...);
  text.resize(length < 0 ? 0 : static_cast<std::size_t>(length));
  return text;
}

std::basic_string<WCHAR> Widen(const std::string& text) { return {text.begin(), text.end()}; }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  std::uint8_t kind = input.Byte();
  Conversion conversion(input);
  std::string before = "[" + std::string(kind >> 4, 'x') + "%" + conversion.flags;
  auto wide = [&before](const char* type) { return Widen(before + type + "]%%"); };
  auto narrow = [&before](const char* type) { return before + type + "]%%"; };
  switch (kind & 15) {
    case 0:
    case 1:
    case 2:
    case 3:
    case 4: {
      const char* types[] = {"d", "u", "x", "X", "o"};
      const char* type = types[kind & 15];
      int value = input.Number<int>();
      FUZZ_CHECK(Narrow(Format(wide(type).c_str(), value)) == Expected(narrow(type), value));
      std::string longType = std::string("l") + type;
      long number = input.Number<long>();
      FUZZ_CHECK(Narrow(Format(wide(longType.c_str()).c_str(), number)) == Expected(narrow(longType.c_str()), number));
      break;
    }
    case 5:
    case 6:
    case 7:
    case 8:
    case 9: {
      const char* types[] = {"f", "e", "g", "E", "G"};
      double value = input.Number<double>();
      SString text = Format(wide(types[(kind & 15) - 5]).c_str(), value);
      FUZZ_CHECK(!text.IsEmpty() && text.View().back() == '%');
      FUZZ_CHECK(text.Length() < 8192);
      break;
    }
    case 10: {
      // 64-bit, in both spellings.
      auto value = input.Number<long long>();
      FUZZ_CHECK(Narrow(Format(wide("I64d").c_str(), value)) == Expected(narrow("lld"), value));
      FUZZ_CHECK(Narrow(Format(wide("lld").c_str(), value)) == Expected(narrow("lld"), value));
      break;
    }
    case 11:
    case 12: {
      std::string flags;  // those that mean nothing for texts have no meaning in C either
      for (char c : conversion.flags) {
        if (c == '-' || c == '.' || (c >= '1' && c <= '9') || (c == '0' && !flags.empty() && flags.back() != '-'))
          flags += c;
      }
      std::string text(input.Rest());
      for (char& c : text) c = c == 0 ? '0' : static_cast<char>(c & 0x7F);
      text = text.c_str();
      SString made = (kind & 15) == 11 ? Format(Widen("%" + flags + "s").c_str(), Widen(text).c_str())
                                       : Format(Widen("%" + flags + "S").c_str(), text.c_str());
      std::string plain(text.size() + 8192, 0);
      int length = std::snprintf(plain.data(), plain.size(), ("%" + flags + "s").c_str(), text.c_str());
      plain.resize(static_cast<std::size_t>(length));
      FUZZ_CHECK(Narrow(made) == plain);
      break;
    }
    case 13:
      Format(wide("c").c_str(), static_cast<int>(input.Number<WCHAR>()));
      Format(wide("p").c_str(), data);
      break;
    default: {
      // Any format at all, as long as it takes no argument but integers.
      auto format = ToText(input.Rest());
      bool takesPointers = false;
      int integers = 0;
      int digitsInARow = 0;
      for (WCHAR c : format) {
        // A width of a gigabyte only costs time and memory.
        digitsInARow = c >= '0' && c <= '9' ? digitsInARow + 1 : 0;
        if (digitsInARow > 5) return 0;
        if (c == '%' || c == '*') ++integers;
        if (c < 0x80 &&
            std::string_view("sSZncCaAeEfFgGhlLIwzjtq").find(static_cast<char>(c)) != std::string_view::npos) {
          takesPointers = true;
        }
      }
      if (integers > 16) return 0;
      if (!takesPointers) Format(format.c_str(), 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16);
    }
  }
  return 0;
}
