#include "tools/qxworkbench/list_view.h"

#include <algorithm>

#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/window/message_entries.h"
#include "tools/common/utf8.h"
#include "tools/qxworkbench/commands.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(FileListView, LineView, on<WM_LBUTTONDOWN, &FileListView::OnLButtonDown>(),
                             on<WM_LBUTTONDBLCLK, &FileListView::OnLButtonDblClk>(),
                             on<WM_KEYDOWN, &FileListView::OnKeyDown>(),
                             on<WM_GETDLGCODE, &FileListView::OnGetDlgCode>())

namespace {

constexpr LPCWSTR kHeads[kColumnCount] = {WTEXT("Name"), WTEXT("Encoding"), WTEXT("Size"), WTEXT("Warning")};
constexpr LPCWSTR kAscending = WTEXT(" \u25B2"), kDescending = WTEXT(" \u25BC");
constexpr int kPadding = 4;

// Digits in groups of three.
SString SizeText(unsigned long long bytes) {
  const std::string plain = std::to_string(bytes);
  std::string digits;
  for (std::size_t at = 0; at < plain.size(); ++at) {
    if (at != 0 && (plain.size() - at) % 3 == 0) digits += ',';
    digits += plain[at];
  }
  return FromUtf8(digits);
}

bool IsDown(int key) { return ::GetKeyState(key) < 0; }

}  // namespace

int FileListView::PreCreateWindow(CREATESTRUCTW* create) {
  create->style |= WS_VSCROLL;
  create->dwExStyle |= WS_EX_CLIENTEDGE;
  return LineView::PreCreateWindow(create);
}

HFONT FileListView::MakeFont(int dpi) { return SGetDefaultUIFont(dpi); }

// --- painting ---

void FileListView::OnDraw(SDC* dc) {
  MeasureColumns(dc);
  LineView::OnDraw(dc);
}

void FileListView::MeasureColumns(SDC* dc) {
  const SSelectObject font(*dc, Font());
  const auto needed = [&](Column column) -> int& { return m_needed[static_cast<int>(column)]; };
  const auto width = [&](const SString& text) {
    return static_cast<int>(dc->GetTextExtent(text).cx) + 2 * Scaled(kPadding);
  };
  for (int i = 0; i < kColumnCount; ++i) m_needed[i] = width(kHeads[i] + SString(kAscending));
  for (const SString& name : m_documents.EncodingNames())
    needed(Column::kEncoding) = std::max(needed(Column::kEncoding), width(name));
  needed(Column::kSize) = std::max(needed(Column::kSize), width(SizeText(m_documents.LargestSize())));
}

// Size and encoding take what their widest text needs, as far as two fifths of the list are left for name and warning.
// These share the rest; without a warning, its head is enough.
SRect FileListView::ColumnRect(Column column, const SRect& row) const {
  const auto needed = [&](Column of) { return m_needed[static_cast<int>(of)]; };
  const int size = std::min(row.Width() / 5, needed(Column::kSize));
  const int encoding = std::min(row.Width() * 3 / 5 - size, needed(Column::kEncoding));
  const int rest = row.Width() - size - encoding, share = rest * 45 / 100;
  const int name = rest - (m_documents.HasWarnings() ? share : std::min(share, needed(Column::kWarning)));
  const int edges[] = {0, name, name + encoding, name + encoding + size, row.Width()};
  const auto at = static_cast<std::size_t>(column);
  return SRect(row.left + edges[at], row.top, row.left + edges[at + 1], row.bottom);
}

SString FileListView::CellText(const Document& document, Column column) const {
  switch (column) {
    case Column::kName:
      return document.name;
    case Column::kEncoding:
      return document.state == Document::State::kWaiting ? SString(WTEXT("...")) : document.encodingName;
    case Column::kSize:
      return SizeText(document.bytes);
    default:
      return document.warning;
  }
}

// The background is the context's.
void FileListView::DrawCell(SDC* dc, const SString& text, const SRect& cell, UINT alignment) {
  dc->ExtTextOutW(cell.left, cell.top, ETO_OPAQUE, &cell, SStringView());
  SRect inner(cell.left + Scaled(kPadding), cell.top, cell.right - Scaled(kPadding), cell.bottom);
  if (text.IsEmpty() || inner.left >= inner.right) return;
  dc->DrawTextW(text, inner, alignment | DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | DT_END_ELLIPSIS);
}

void FileListView::DrawRow(SDC* dc, int row, const SRect& rect) {
  const int number = m_documents.NumberAt(row);
  const Document& document = m_documents.At(number);
  const bool hasFocus = GetFocus() == this;
  const int back = !document.isSelected ? COLOR_WINDOW : hasFocus ? COLOR_HIGHLIGHT : COLOR_3DLIGHT;
  const int text = !document.isSelected ? COLOR_WINDOWTEXT : hasFocus ? COLOR_HIGHLIGHTTEXT : COLOR_BTNTEXT;
  dc->SetBkColor(::GetSysColor(back));
  dc->SetTextColor(::GetSysColor(text));
  for (int i = 0; i < kColumnCount; ++i) {
    const auto column = static_cast<Column>(i);
    DrawCell(dc, CellText(document, column), ColumnRect(column, rect), column == Column::kSize ? DT_RIGHT : DT_LEFT);
  }
  if (hasFocus && number == m_focused) dc->DrawFocusRect(rect);
}

void FileListView::DrawHead(SDC* dc, const SRect& rect) {
  dc->SetBkColor(::GetSysColor(COLOR_3DFACE));
  dc->SetTextColor(::GetSysColor(COLOR_BTNTEXT));
  for (int i = 0; i < kColumnCount; ++i) {
    const auto column = static_cast<Column>(i);
    SRect cell = ColumnRect(column, rect);
    dc->ExtTextOutW(cell.left, cell.top, ETO_OPAQUE, &cell, SStringView());
    dc->DrawEdge(cell, EDGE_RAISED, BF_RECT);
    SRect inner(cell.left + Scaled(kPadding), cell.top, cell.right - Scaled(kPadding), cell.bottom);
    const UINT alignment = column == Column::kSize ? DT_RIGHT : DT_LEFT;
    dc->DrawTextW(HeadText(column), inner, alignment | DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | DT_END_ELLIPSIS);
  }
}

SString FileListView::HeadText(Column column) const {
  SString text(kHeads[static_cast<int>(column)]);
  if (column == m_documents.SortColumn()) text += m_documents.IsDescending() ? kDescending : kAscending;
  return text;
}

// --- changes ---

void FileListView::ListChanged() {
  if (m_focused >= m_documents.Count()) m_focused = m_anchor = -1;
  RowsChanged();
  Invalidate(0);
}

void FileListView::SortBy(Column column) {
  const bool turns = column == m_documents.SortColumn() && !m_documents.IsDescending();
  m_documents.SortBy(column, turns);
  if (m_focused >= 0) ShowRow(m_documents.RowOf(m_focused));
  Invalidate(0);
}

void FileListView::SelectAll() {
  m_documents.SelectAll(true);
  Invalidate(0);
  Tell(kSelectionChanged);
}

void FileListView::Focus(int number) {
  if (number >= 0) MoveTo(m_documents.RowOf(number), false, false);
}

void FileListView::SelectRange(int fromRow, int toRow) {
  m_documents.SelectAll(false);
  for (int row = std::min(fromRow, toRow); row <= std::max(fromRow, toRow); ++row)
    m_documents.Select(m_documents.NumberAt(row), true);
}

// Moves the keyboard to a row; the selection goes from the anchor to there, or stays.
void FileListView::MoveTo(int row, bool extends, bool onlyMoves) {
  if (m_documents.Count() == 0) return;
  row = std::clamp(row, 0, m_documents.Count() - 1);
  m_focused = m_documents.NumberAt(row);
  if (!extends && !onlyMoves) m_anchor = m_focused;
  if (m_anchor < 0) m_anchor = m_focused;
  if (!onlyMoves) SelectRange(m_documents.RowOf(m_anchor), row);
  ShowRow(row);
  Invalidate(0);
  Tell(kSelectionChanged);
}

void FileListView::Tell(UINT command) {
  if (SFrameWnd* frame = GetParentFrame()) frame->SendMessageW(WM_COMMAND, command);
}

// --- input ---

void FileListView::OnLButtonDown(UINT flags, SPoint point) {
  SetFocus();
  if (point.y < HeadHeight()) {
    for (int i = 0; i < kColumnCount; ++i) {
      const auto column = static_cast<Column>(i);
      if (ColumnRect(column, GetClientRect()).Contains(point)) SortBy(column);
    }
    return;
  }
  const int row = RowAt(point);
  if (row < 0) return;
  const int number = m_documents.NumberAt(row);
  if (!(flags & MK_CONTROL)) return MoveTo(row, (flags & MK_SHIFT) != 0, false);
  m_documents.Select(number, !m_documents.At(number).isSelected);
  m_anchor = number;
  MoveTo(row, false, true);
}

void FileListView::OnLButtonDblClk(UINT, SPoint point) {
  if (RowAt(point) >= 0) Tell(kPreview);
}

void FileListView::OnKeyDown(UINT key, UINT repeat, UINT flags) {
  const bool shift = IsDown(VK_SHIFT), control = IsDown(VK_CONTROL);
  const int row = m_focused < 0 ? -1 : m_documents.RowOf(m_focused);
  switch (key) {
    case VK_UP:
      return MoveTo(row < 0 ? 0 : row - 1, shift, control);
    case VK_DOWN:
      return MoveTo(row + 1, shift, control);
    case VK_PRIOR:
      return MoveTo(row - PageRows(), shift, control);
    case VK_NEXT:
      return MoveTo(row + PageRows(), shift, control);
    case VK_HOME:
      return MoveTo(0, shift, control);
    case VK_END:
      return MoveTo(RowCount() - 1, shift, control);
    case VK_SPACE:
      if (row < 0) return;
      m_documents.Select(m_focused, !m_documents.At(m_focused).isSelected);
      return MoveTo(row, false, true);
    case VK_RETURN:
      return Tell(kPreview);
    default:
      return LineView::OnKeyDown(key, repeat, flags);
  }
}
