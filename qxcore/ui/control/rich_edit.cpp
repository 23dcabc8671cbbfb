#include "qxcore/ui/control/rich_edit.h"

#include "qxcore/core/exception.h"
#include "qxcore/platform/internal/rich_edit_class.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SRichEditCtrl, SWnd, 2)

namespace {

constexpr UINT kUtf16 = 1200;

template <class T>
LPARAM AddressOf(T& value) {
  return reinterpret_cast<LPARAM>(&value);
}

}  // namespace

SRichEditCtrl::~SRichEditCtrl() = default;

int SRichEditCtrl::Create(DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(nullptr, nullptr, style, rect, parent, id);
}

int SRichEditCtrl::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) create->lpszClass = platform::LoadRichEditClass();
  return create->lpszClass != nullptr;
}

// --- the whole content ---

int SRichEditCtrl::SetPlainText(const SString& text) {
  return SendMessageW(WM_SETTEXT, 0, reinterpret_cast<LPARAM>(text.GetSafePointer())) != 0;
}

SString SRichEditCtrl::GetPlainText() const {
  SString text;
  GETTEXTLENGTHEX measure = {GTL_USECRLF | GTL_PRECISE | GTL_NUMCHARS, kUtf16};
  const LRESULT length = SendMessageW(EM_GETTEXTLENGTHEX, reinterpret_cast<WPARAM>(&measure));
  if (length <= 0) return text;
  if (length >= 0x3FFFFFFF) throw SEOutOfMemory();  // the message counts its bytes in 32 bits
  GETTEXTEX how = {static_cast<DWORD>((length + 1) * static_cast<LRESULT>(sizeof(WCHAR))), GT_USECRLF, kUtf16, nullptr,
                   nullptr};
  WCHAR* buffer = text.GetBufferSetLength(static_cast<int>(length));
  SendMessageW(EM_GETTEXTEX, reinterpret_cast<WPARAM>(&how), reinterpret_cast<LPARAM>(buffer));
  return text;
}

long SRichEditCtrl::StreamIn(UINT format, EDITSTREAM& stream) {
  return static_cast<long>(SendMessageW(EM_STREAMIN, format, AddressOf(stream)));
}

long SRichEditCtrl::StreamOut(UINT format, EDITSTREAM& stream) const {
  return static_cast<long>(SendMessageW(EM_STREAMOUT, format, AddressOf(stream)));
}

int SRichEditCtrl::SetTextMode(UINT mode) { return SendMessageW(EM_SETTEXTMODE, mode) == 0; }
void SRichEditCtrl::SetTextLimit(long count) { SendMessageW(EM_EXLIMITTEXT, 0, count); }

long SRichEditCtrl::GetTextLength() const {
  GETTEXTLENGTHEX measure = {GTL_PRECISE | GTL_NUMCHARS, kUtf16};
  return static_cast<long>(SendMessageW(EM_GETTEXTLENGTHEX, reinterpret_cast<WPARAM>(&measure)));
}

int SRichEditCtrl::GetModify() const { return SendMessageW(EM_GETMODIFY) != 0; }
void SRichEditCtrl::SetModify(int modified) { SendMessageW(EM_SETMODIFY, modified != 0); }

// --- the selection ---

void SRichEditCtrl::GetSel(long* start, long* end) const {
  CHARRANGE range = {};
  SendMessageW(EM_EXGETSEL, 0, AddressOf(range));
  *start = range.cpMin;
  *end = range.cpMax;
}

void SRichEditCtrl::SetSel(long start, long end) {
  CHARRANGE range = {static_cast<LONG>(start), static_cast<LONG>(end)};
  SendMessageW(EM_EXSETSEL, 0, AddressOf(range));
}

// The message ends paragraphs with CR alone.
SString SRichEditCtrl::GetSelText() const {
  long start, end;
  GetSel(&start, &end);
  SString text;
  if (end <= start) return text;
  WCHAR* buffer = text.GetBufferSetLength(static_cast<int>(end - start));
  const LRESULT length = SendMessageW(EM_GETSELTEXT, 0, reinterpret_cast<LPARAM>(buffer));
  text = text.Left(static_cast<int>(length));
  text.ReplaceAll(WTEXT("\r"), SString::CrLf);
  return text;
}

void SRichEditCtrl::ReplaceSel(LPCWSTR text, int canUndo) {
  SendMessageW(EM_REPLACESEL, canUndo != 0, reinterpret_cast<LPARAM>(text));
}

// --- formats ---

DWORD SRichEditCtrl::GetSelectionCharFormat(CHARFORMAT2W& format) const {
  format.cbSize = sizeof format;
  return static_cast<DWORD>(SendMessageW(EM_GETCHARFORMAT, SCF_SELECTION, AddressOf(format)));
}

int SRichEditCtrl::SetSelectionCharFormat(CHARFORMAT2W& format) {
  format.cbSize = sizeof format;
  return SendMessageW(EM_SETCHARFORMAT, SCF_SELECTION, AddressOf(format)) != 0;
}

int SRichEditCtrl::SetAllCharFormat(CHARFORMAT2W& format) {
  format.cbSize = sizeof format;
  return SendMessageW(EM_SETCHARFORMAT, SCF_ALL, AddressOf(format)) != 0;
}
