#include "tools/qxworkbench/document_list.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include "tools/common/console.h"
#include "tools/common/utf8.h"

namespace {

SString Folded(SString name) {
  name.ToLower();
  return name;
}

int Compare(SStringView a, SStringView b) { return a.compare(b); }

}  // namespace

void DocumentList::Clear() {
  m_documents.clear();
  m_order.clear();
  m_selected = 0;
  m_encodingNames.clear();
  m_largestSize = 0;
  m_hasWarnings = false;
}

int DocumentList::Add(Document document) {
  const int number = Count();
  NoteTexts(document);
  SString folded = Folded(document.name);
  m_documents.push_back({std::move(document), std::move(folded)});
  Insert(number);
  return number;
}

void DocumentList::SetFinding(int number, const Finding& finding) {
  const bool movesRow = m_column != Column::kName;
  if (movesRow) m_order.erase(m_order.begin() + RowOf(number));
  Document& document = m_documents[static_cast<std::size_t>(number)].document;
  document.state = finding.error.empty() ? Document::State::kDetected : Document::State::kFailed;
  document.encoding = finding.value;
  document.encodingName = finding.encoding;
  if (finding.error.empty()) document.bytes = finding.bytes;
  document.warning = finding.error.empty() ? finding.warning : FromUtf8(finding.error);
  NoteTexts(document);
  if (movesRow) Insert(number);
}

void DocumentList::SetConverted(int number, Encoding encoding) {
  Finding finding;
  finding.value = encoding;
  finding.encoding = ShownName(encoding);
  std::error_code error;
  finding.bytes = std::filesystem::file_size(console::PathOf(At(number).native), error);
  if (error) finding.bytes = At(number).bytes;
  SetFinding(number, finding);
}

void DocumentList::NoteTexts(const Document& document) {
  if (!document.encodingName.IsEmpty()) m_encodingNames.insert(document.encodingName);
  m_largestSize = std::max(m_largestSize, document.bytes);
  m_hasWarnings |= !document.warning.IsEmpty();
}

int DocumentList::RowOf(int number) const {
  return static_cast<int>(std::find(m_order.begin(), m_order.end(), number) - m_order.begin());
}

int DocumentList::Find(const SString& name) const {
  const SString folded = Folded(name);
  for (int number = 0; number < Count(); ++number)
    if (EntryAt(number).folded == folded || Folded(At(number).below) == folded) return number;
  return -1;
}

int DocumentList::FailedCount() const {
  return static_cast<int>(std::count_if(m_documents.begin(), m_documents.end(), [](const Entry& entry) {
    return entry.document.state == Document::State::kFailed;
  }));
}

// Numbers settle what is equal, so that the order is one.
bool DocumentList::IsBefore(int a, int b) const {
  const Entry &left = EntryAt(a), &right = EntryAt(b);
  int order = 0;
  switch (m_column) {
    case Column::kName:
      break;
    case Column::kEncoding:
      order = Compare(left.document.encodingName, right.document.encodingName);
      break;
    case Column::kSize:
      order = left.document.bytes < right.document.bytes ? -1 : left.document.bytes > right.document.bytes;
      break;
    case Column::kWarning:
      order = Compare(left.document.warning, right.document.warning);
      break;
  }
  if (order == 0 && m_column != Column::kName) {
    order = Compare(left.folded, right.folded);
    return order != 0 ? order < 0 : a < b;
  }
  if (order == 0) order = Compare(left.folded, right.folded);
  if (order == 0) return a < b;
  return m_isDescending ? order > 0 : order < 0;
}

void DocumentList::Insert(int number) {
  const auto isBefore = [this](int a, int b) { return IsBefore(a, b); };
  m_order.insert(std::lower_bound(m_order.begin(), m_order.end(), number, isBefore), number);
}

void DocumentList::SortBy(Column column, bool isDescending) {
  m_column = column;
  m_isDescending = isDescending;
  std::sort(m_order.begin(), m_order.end(), [this](int a, int b) { return IsBefore(a, b); });
}

void DocumentList::Select(int number, bool isSelected) {
  Document& document = m_documents[static_cast<std::size_t>(number)].document;
  if (document.isSelected == isSelected) return;
  document.isSelected = isSelected;
  m_selected += isSelected ? 1 : -1;
}

void DocumentList::SelectAll(bool isSelected) {
  for (Entry& entry : m_documents) entry.document.isSelected = isSelected;
  m_selected = isSelected ? Count() : 0;
}

std::vector<int> DocumentList::Selected() const {
  std::vector<int> selected;
  for (const int number : m_order)
    if (At(number).isSelected) selected.push_back(number);
  return selected;
}
