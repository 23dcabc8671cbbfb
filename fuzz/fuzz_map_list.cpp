// The list form of the string maps: any text is read without harm, and what was read survives the way to
// text and back, in every kind of map.

#include "fuzz/fuzz_input.h"
#include "qxcore/container/string_map.h"

namespace {

template <class Map>
void RoundTrip(const WCHAR* list, WCHAR item, WCHAR pair, WCHAR escape) {
  Map map;
  int items = map.AddFromList(list, item, pair, escape);
  FUZZ_CHECK(map.GetCount() <= items);
  SString text = map.GetAsList(item, pair, escape);
  // One entry with neither key nor value is the same text as none.
  Map read;
  read.AddFromList(text, item, pair, escape);
  FUZZ_CHECK(read == map && map == read);
  FUZZ_CHECK(read.GetAsList(item, pair, escape) == text);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  constexpr WCHAR kCharacters[] = WTEXT(",=\\;:|^a");
  std::uint8_t choice = input.Byte();
  WCHAR item = kCharacters[choice & 7];
  WCHAR pair = kCharacters[choice >> 3 & 7];
  WCHAR escape = item == '\\' || pair == '\\' ? (item == '^' || pair == '^' ? '|' : '^') : '\\';
  if (escape == item || escape == pair) return 0;
  auto list = ToText(input.Rest());
  RoundTrip<SStringMap>(list.c_str(), item, pair, escape);
  RoundTrip<SStringMapNoCase>(list.c_str(), item, pair, escape);
  RoundTrip<SStringUnsortedMap>(list.c_str(), item, pair, escape);
  RoundTrip<SStringUnsortedMapNoCase>(list.c_str(), item, pair, escape);
  SStringMap map;
  map.AddFromList(list.c_str(), list.c_str(), item, pair, list.c_str(), choice & 1);
  return 0;
}
