#include "qxcore/platform/posix/controls/rich_edit.h"

#include <algorithm>
#include <memory>
#include <new>
#include <string>

#include "qxcore/platform/internal/rich_edit_class.h"
#include "qxcore/platform/posix/controls/rich_edit_control.h"
#include "qxcore/platform/posix/controls/rtf_reader.h"

namespace platform {

const WCHAR* LoadRichEditClass() { return MSFTEDIT_CLASS; }

namespace rich {
namespace {

constexpr UINT kUtf16 = 1200;

Control* ControlOf(HWND window) { return reinterpret_cast<Control*>(GetWindowLongPtrW(window, 0)); }

// --- text ---

void SetText(Control& control, const WCHAR* text) {
  const std::u16string_view view = text != nullptr ? text : u"";
  Document document;
  if (control.mode == TM_RICHTEXT && IsRtf(view)) {
    ReadRtf(view, document);
  } else {
    ReadText(view, document);
  }
  SetDocument(control, std::move(document));
}

// As much as fits, with a terminator. Returns the number of characters before it.
std::size_t CopyOut(std::u16string_view text, WCHAR* buffer, std::size_t room) {
  if (room == 0) return 0;
  const std::size_t length = text.copy(buffer, room - 1);
  buffer[length] = 0;
  return length;
}

// Paragraphs end with CR alone unless CR LF is asked for.
std::u16string WithoutLineFeeds(std::u16string_view text) {
  std::u16string shorter(text);
  std::erase(shorter, u'\n');
  return shorter;
}

LRESULT GetTextEx(const Control& control, const GETTEXTEX& how, WCHAR* buffer) {
  if (how.codepage != kUtf16 || buffer == nullptr) return 0;
  const std::size_t room = how.cb / sizeof(WCHAR);
  return static_cast<LRESULT>((how.flags & GT_USECRLF) != 0 ? CopyOut(control.Text(), buffer, room)
                                                            : CopyOut(WithoutLineFeeds(control.Text()), buffer, room));
}

LRESULT GetTextLengthEx(const Control& control, const GETTEXTLENGTHEX& how) {
  if (how.codepage != kUtf16) return E_INVALIDARG;
  const std::u16string_view text = control.Text();
  std::size_t length = text.size();
  if ((how.flags & GTL_USECRLF) == 0) length -= static_cast<std::size_t>(std::count(text.begin(), text.end(), u'\n'));
  return static_cast<LRESULT>((how.flags & GTL_NUMBYTES) != 0 ? length * sizeof(WCHAR) : length);
}

// The mode changes only while there is no text.
LRESULT SetTextMode(Control& control, WPARAM mode) {
  if (!control.Text().empty()) return E_FAIL;
  control.mode = (mode & TM_PLAINTEXT) != 0 ? TM_PLAINTEXT : TM_RICHTEXT;
  return 0;
}

// --- messages ---

LRESULT Create(HWND window, WPARAM wParam, LPARAM lParam) {
  auto control = std::make_unique<Control>();
  SetText(*control, reinterpret_cast<const CREATESTRUCTW*>(lParam)->lpszName);
  SetWindowLongPtrW(window, 0, reinterpret_cast<LONG_PTR>(control.release()));
  return DefWindowProcW(window, WM_NCCREATE, wParam, lParam);
}

LRESULT Answer(Control& control, HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_SETTEXT:
      SetText(control, reinterpret_cast<const WCHAR*>(lParam));
      return TRUE;
    case WM_GETTEXT:
      return static_cast<LRESULT>(CopyOut(control.Text(), reinterpret_cast<WCHAR*>(lParam), wParam));
    case WM_GETTEXTLENGTH:
      return static_cast<LRESULT>(control.Text().size());
    case EM_STREAMIN:
      return StreamIn(control, wParam, *reinterpret_cast<EDITSTREAM*>(lParam));
    case EM_STREAMOUT:
      return StreamOut(control, wParam, *reinterpret_cast<EDITSTREAM*>(lParam));
    case EM_GETTEXTEX:
      return GetTextEx(control, *reinterpret_cast<GETTEXTEX*>(wParam), reinterpret_cast<WCHAR*>(lParam));
    case EM_GETTEXTLENGTHEX:
      return GetTextLengthEx(control, *reinterpret_cast<GETTEXTLENGTHEX*>(wParam));
    case EM_SETTEXTMODE:
      return SetTextMode(control, wParam);
    case EM_GETTEXTMODE:
      return control.mode;
    case EM_EXLIMITTEXT:
      control.limit = lParam > 0 ? static_cast<std::size_t>(lParam) : 65536;
      return 0;
    case EM_GETMODIFY:
      return control.isModified;
    case EM_SETMODIFY:
      control.isModified = wParam != 0;
      return 0;
    case EM_EXGETSEL:
      *reinterpret_cast<CHARRANGE*>(lParam) = control.selection;
      return 0;
    case EM_EXSETSEL:
      return SetSelection(control, *reinterpret_cast<const CHARRANGE*>(lParam));
    case EM_GETSELTEXT:
      return GetSelectedText(control, reinterpret_cast<WCHAR*>(lParam));
    case EM_REPLACESEL:
      ReplaceSelection(control, reinterpret_cast<const WCHAR*>(lParam));
      return 0;
    case EM_GETCHARFORMAT:
      return GetCharFormat(control, *reinterpret_cast<CHARFORMATW*>(lParam));
    case EM_SETCHARFORMAT:
      return SetCharFormat(control, wParam, *reinterpret_cast<const CHARFORMATW*>(lParam));
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

// What a message answers when memory runs out; the control is as it was.
LRESULT Fail(UINT message, LPARAM lParam) {
  if (message == EM_STREAMIN || message == EM_STREAMOUT)
    reinterpret_cast<EDITSTREAM*>(lParam)->dwError = ERROR_NOT_ENOUGH_MEMORY;
  return 0;
}

}  // namespace

Control::Control() { ReadText(u"", document); }

void SetDocument(Control& control, Document&& document) {
  control.document = std::move(document);
  control.selection = {0, 0};
  control.typing.reset();
  control.isModified = false;
}

LRESULT CALLBACK RichEditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  Control* control = ControlOf(window);
  try {
    if (message == WM_NCCREATE) return Create(window, wParam, lParam);
    if (message == WM_NCDESTROY) {
      SetWindowLongPtrW(window, 0, 0);
      delete control;
      control = nullptr;
    }
    return control != nullptr ? Answer(*control, window, message, wParam, lParam)
                              : DefWindowProcW(window, message, wParam, lParam);
  } catch (const std::bad_alloc&) {
    return Fail(message, lParam);
  }
}

}  // namespace rich
}  // namespace platform
