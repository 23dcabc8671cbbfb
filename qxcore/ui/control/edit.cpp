#include "qxcore/ui/control/edit.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SEdit, SWnd, 2)

SEdit::~SEdit() = default;

int SEdit::Create(DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(WTEXT("Edit"), nullptr, style, rect, parent, id);
}

void SEdit::GetSel(int* start, int* end) const {
  DWORD from = 0, to = 0;
  SendMessageW(EM_GETSEL, reinterpret_cast<WPARAM>(&from), reinterpret_cast<LPARAM>(&to));
  *start = static_cast<int>(from);
  *end = static_cast<int>(to);
}

void SEdit::SetSel(int start, int end) { SendMessageW(EM_SETSEL, static_cast<WPARAM>(start), end); }
void SEdit::ReplaceSel(LPCWSTR text, int canUndo) {
  SendMessageW(EM_REPLACESEL, static_cast<WPARAM>(canUndo), reinterpret_cast<LPARAM>(text));
}
void SEdit::SetLimitText(int count) { SendMessageW(EM_LIMITTEXT, static_cast<WPARAM>(count)); }
int SEdit::GetLimitText() const { return static_cast<int>(SendMessageW(EM_GETLIMITTEXT)); }
int SEdit::GetModify() const { return static_cast<int>(SendMessageW(EM_GETMODIFY)); }
void SEdit::SetModify(int modified) { SendMessageW(EM_SETMODIFY, static_cast<WPARAM>(modified)); }
int SEdit::CanUndo() const { return static_cast<int>(SendMessageW(EM_CANUNDO)); }
int SEdit::Undo() { return static_cast<int>(SendMessageW(EM_UNDO)); }
void SEdit::EmptyUndoBuffer() { SendMessageW(EM_EMPTYUNDOBUFFER); }
void SEdit::Cut() { SendMessageW(WM_CUT); }
void SEdit::Copy() { SendMessageW(WM_COPY); }
void SEdit::Paste() { SendMessageW(WM_PASTE); }
void SEdit::Clear() { SendMessageW(WM_CLEAR); }
int SEdit::GetLineCount() const { return static_cast<int>(SendMessageW(EM_GETLINECOUNT)); }
WCHAR SEdit::GetPasswordChar() const { return static_cast<WCHAR>(SendMessageW(EM_GETPASSWORDCHAR)); }
void SEdit::SetPasswordChar(WCHAR character) { SendMessageW(EM_SETPASSWORDCHAR, character); }
