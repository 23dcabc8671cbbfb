// The list form of SStringTable: any text is read without harm, by the rules as they stand, and what was
// read survives the way to text and back; the orders sort it.

#include <vector>

#include "fuzz/fuzz_input.h"
#include "qxcore/container/string_table.h"
#include "qxcore/string/natural_compare.h"

namespace {

using Text = std::basic_string<WCHAR>;

// The rules of AddFromList, one character at a time.
std::vector<Text> Parts(const Text& list, const Text& separators, WCHAR escape) {
  auto isSeparator = [&separators](WCHAR c) { return separators.find(c) != Text::npos; };
  std::vector<Text> parts;
  if (list.empty()) return parts;
  parts.emplace_back();
  for (std::size_t i = 0; i < list.size(); ++i) {
    if (isSeparator(list[i])) {
      while (i + 1 < list.size() && list[i + 1] != list[i] && isSeparator(list[i + 1])) ++i;
      parts.emplace_back();
    } else if (escape != 0 && list[i] == escape && i + 1 < list.size()) {
      parts.back() += list[++i];
    } else {
      parts.back() += list[i];
    }
  }
  return parts;
}

void CheckOrder(SStringTable table, void (SStringTable::*sort)(int), int (*compare)(const WCHAR*, const WCHAR*)) {
  (table.*sort)(SStringTable::kAscending);
  for (int i = 1; i < table.GetCount(); ++i) FUZZ_CHECK(compare(table[i - 1], table[i]) <= 0);
  (table.*sort)(SStringTable::kDescending);
  for (int i = 1; i < table.GetCount(); ++i) FUZZ_CHECK(compare(table[i - 1], table[i]) >= 0);
}

int ByUnits(const WCHAR* a, const WCHAR* b) { return SString(a).Compare(b); }
int WithoutCase(const WCHAR* a, const WCHAR* b) { return SString(a).CompareNoCase(b); }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  constexpr WCHAR kEscapes[] = WTEXT("\\^a\0");
  const WCHAR escape = kEscapes[input.Byte() & 3];
  const Text separators = ToText(input.Part("|"));
  const Text list = ToText(input.Rest());

  SStringTable table;
  const int count = table.AddFromList(SString(SStringView(list)), separators.c_str(), escape);
  const std::vector<Text> parts = Parts(list, separators, escape);
  FUZZ_CHECK(count == table.GetCount() && static_cast<std::size_t>(count) == parts.size());
  for (int i = 0; i < count; ++i) FUZZ_CHECK(table[i].View() == SStringView(parts[static_cast<std::size_t>(i)]));

  const SString text = table.GetAsList(',', '\\');
  SStringTable back;
  back.SetFromList(text, WTEXT(","), '\\');
  const bool isNothing = count == 1 && table[0].IsEmpty();  // the same text as no element
  FUZZ_CHECK(isNothing ? back.IsEmpty() : back == table);

  CheckOrder(table, &SStringTable::Sort, ByUnits);
  CheckOrder(table, &SStringTable::SortNoCase, WithoutCase);
  CheckOrder(table, &SStringTable::SortNumbered, _tcscmpi);
  CheckOrder(table, &SStringTable::SortNumberedNoCase, _tcsicmpi);
  return 0;
}
