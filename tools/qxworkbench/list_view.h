// The list of documents: name, encoding, size and warning, sorted by the column whose head was clicked.
//
// Keys: the arrows and Page Up, Page Down, Home and End move; with Shift they select up to there, with Ctrl they only
// move. Space selects or deselects, Ctrl+A selects all, Enter shows a preview, Ctrl+1 to Ctrl+4 sort by a column.
#pragma once

#include "tools/qxworkbench/document_list.h"
#include "tools/qxworkbench/line_view.h"

class FileListView : public LineView {
 public:
  // The list is the model's. The frame gets kPreview and kSelectionChanged (commands.h) as commands.
  explicit FileListView(DocumentList& documents) : m_documents(documents) {}

  // The list was emptied, documents came or changed.
  void ListChanged();
  // Sorts; the same column again turns the order round.
  void SortBy(Column column);
  // The document that the keyboard is at; -1 for none.
  int Focused() const { return m_focused; }
  // Moves the keyboard to a document and selects it alone.
  void Focus(int number);
  void SelectAll();

  int PreCreateWindow(CREATESTRUCTW* create) override;
  void OnDraw(SDC* dc) override;

 protected:
  int RowCount() const override { return m_documents.Count(); }
  void DrawRow(SDC* dc, int row, const SRect& rect) override;
  void DrawHead(SDC* dc, const SRect& rect) override;
  int HeadHeight() const override { return RowHeight() + Scaled(4); }
  HFONT MakeFont(int dpi) override;

  void OnLButtonDown(UINT flags, SPoint point);
  void OnLButtonDblClk(UINT flags, SPoint point);
  void OnKeyDown(UINT key, UINT repeat, UINT flags);
  UINT OnGetDlgCode() { return DLGC_WANTARROWS; }

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  void MeasureColumns(SDC* dc);
  SString HeadText(Column column) const;
  SRect ColumnRect(Column column, const SRect& row) const;
  SString CellText(const Document& document, Column column) const;
  void DrawCell(SDC* dc, const SString& text, const SRect& cell, UINT alignment);
  void MoveTo(int row, bool extends, bool onlyMoves);
  void SelectRange(int fromRow, int toRow);
  void Tell(UINT command);

  DocumentList& m_documents;
  int m_focused = -1;               // a document's number
  int m_anchor = -1;                // where a range begins
  int m_needed[kColumnCount] = {};  // pixels for the widest text, as the list was painted last
};
