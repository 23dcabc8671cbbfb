// The files of the open folder: what is known of each, their order in the list, and which ones are selected.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "tools/common/finding.h"

struct Document {
  enum class State { kWaiting, kDetected, kFailed };

  SString path;        // as the library spells it
  SString below;       // the part of it below the open folder
  SString name;        // the same as the system spells it
  std::string native;  // the path as an argument of TextSource
  State state = State::kWaiting;
  Encoding encoding = 0;  // with Finding's remark of XML
  SString encodingName;
  unsigned long long bytes = 0;
  SString warning;  // of detection; for a failed document, why it could not be looked at
  bool isSelected = false;
};

enum class Column { kName, kEncoding, kSize, kWarning };
inline constexpr int kColumnCount = 4;

// Documents have a number for good, in the order in which they were found, and a row, their place in the order of
// the list. Both count from 0.
class DocumentList {
 public:
  void Clear();
  // Takes a document in, at its row. Returns its number.
  int Add(Document document);
  // Notes what detection found, and moves the document to its row.
  void SetFinding(int number, const Finding& finding);
  // Notes that the file was converted to an encoding.
  void SetConverted(int number, Encoding encoding);

  int Count() const { return static_cast<int>(m_documents.size()); }
  const Document& At(int number) const { return m_documents[static_cast<std::size_t>(number)].document; }
  int NumberAt(int row) const { return m_order[static_cast<std::size_t>(row)]; }
  const Document& AtRow(int row) const { return At(NumberAt(row)); }
  int RowOf(int number) const;
  // The document with this name, in any case of letters and in either spelling; -1 for none.
  int Find(const SString& name) const;

  // What the columns must have room for: the encodings that occur, the largest file, whether any has a warning.
  const std::set<SString>& EncodingNames() const { return m_encodingNames; }
  unsigned long long LargestSize() const { return m_largestSize; }
  bool HasWarnings() const { return m_hasWarnings; }

  // How many could not be looked at.
  int FailedCount() const;

  // Sorts by a column; equal ones follow by their names.
  void SortBy(Column column, bool isDescending);
  Column SortColumn() const { return m_column; }
  bool IsDescending() const { return m_isDescending; }

  void Select(int number, bool isSelected);
  void SelectAll(bool isSelected);
  int SelectedCount() const { return m_selected; }
  // The numbers of the selected documents, in the order of the list.
  std::vector<int> Selected() const;

 private:
  struct Entry {
    Document document;
    SString folded;  // the name, by which names are compared
  };
  void NoteTexts(const Document& document);
  const Entry& EntryAt(int number) const { return m_documents[static_cast<std::size_t>(number)]; }
  bool IsBefore(int a, int b) const;
  void Insert(int number);

  std::vector<Entry> m_documents;
  std::vector<int> m_order;  // by row
  Column m_column = Column::kName;
  bool m_isDescending = false;
  int m_selected = 0;
  std::set<SString> m_encodingNames;
  unsigned long long m_largestSize = 0;
  bool m_hasWarnings = false;
};
