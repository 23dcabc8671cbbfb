// Writes qxcore/platform/bmp_data.inc: the case pairs and character classes of the Basic Multilingual Plane,
// from ICU, as ranges. Run it to move to another version of Unicode; the checksums that the tests pin
// change with it.
//
//   g++ -std=c++20 tools/unicode/make_bmp_data.cpp -licuuc -o make_bmp_data && ./make_bmp_data
//   >qxcore/platform/bmp_data.inc

#include <unicode/uchar.h>
#include <unicode/uversion.h>

#include <cstdio>

namespace {

using Mapping = UChar32 (*)(UChar32);

int Map(Mapping mapping, int c) {
  UChar32 mapped = c >= 0xD800 && c <= 0xDFFF ? c : mapping(c);
  return mapped <= 0xFFFF ? static_cast<int>(mapped) : c;
}

// One line a run of characters that move by the same distance, one or two apart.
void PrintCase(const char* macro, Mapping mapping) {
  for (int first = 0; first < 0x10000; ++first) {
    int delta = Map(mapping, first) - first;
    if (delta == 0) continue;
    auto runs = [&](int c) { return c < 0x10000 && Map(mapping, c) - c == delta; };
    int step = runs(first + 1) ? 1 : 2, last = first;
    while (runs(last + step) && (step == 1 || !runs(last + 1))) last += step;
    std::printf("%s(0x%04X, 0x%04X, %d, %d)\n", macro, first, last, step, delta);
    // A run two apart may enclose characters that move otherwise; they are met on the way.
    if (step == 1) {
      first = last;
    } else {
      int inner = first + 1;
      for (; inner < last; inner += 2)
        if (Map(mapping, inner) != inner)
          std::printf("%s(0x%04X, 0x%04X, 1, %d)\n", macro, inner, inner, Map(mapping, inner) - inner);
      first = last;
    }
  }
}

int Classes(int c) {
  if (c >= 0xD800 && c <= 0xDFFF) return 0;
  return (u_isalpha(c) ? 1 : 0) | (u_isdigit(c) ? 2 : 0) | (u_isupper(c) ? 4 : 0) | (u_islower(c) ? 8 : 0) |
         (u_isUWhiteSpace(c) ? 16 : 0) |
         (u_ispunct(c) || (c < 0x80 && c > 0x20 && c != 0x7F && !u_isalnum(c)) ? 32 : 0) |
         (u_iscntrl(c) && !u_isUWhiteSpace(c) ? 64
          : u_charType(c) == U_CONTROL_CHAR   ? 64
                                              : 0) |
         (u_isprint(c) ? 128 : 0);
}

void PrintClasses() {
  for (int first = 0; first < 0x10000;) {
    int bits = Classes(first), end = first;
    while (end < 0x10000 && Classes(end) == bits) ++end;
    if (bits != 0) std::printf("CLASS(0x%04X, 0x%04X, 0x%02X)\n", first, end - 1, bits);
    first = end;
  }
}

}  // namespace

int main() {
  std::printf("// Made by tools/unicode/make_bmp_data.cpp from Unicode %s; not edited by hand.\n", U_UNICODE_VERSION);
  PrintCase("LOWER", u_tolower);
  PrintCase("UPPER", u_toupper);
  PrintClasses();
}
