#include "qxcore/platform/posix/controls/rich_edit.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <new>
#include <string>

#include "qxcore/platform/internal/rich_edit_class.h"
#include "qxcore/platform/posix/controls/rtf_reader.h"
#include "qxcore/platform/posix/controls/rtf_writer.h"
#include "qxcore/platform/win32/rich_edit.h"

namespace platform {

const WCHAR* LoadRichEditClass() { return MSFTEDIT_CLASS; }

namespace rich {
namespace {

constexpr LONG kPiece = 1 << 16;  // bytes that a stream's callback is asked for at a time
constexpr UINT kUtf16 = 1200;

// What a control keeps in its window.
struct Control {
  Document document;
  std::size_t limit = 32767;  // characters of plain text
  int mode = TM_RICHTEXT;

  Control() { ReadText(u"", document); }
  std::u16string_view Text() const { return document.text.View(); }
};

Control* ControlOf(HWND window) { return reinterpret_cast<Control*>(GetWindowLongPtrW(window, 0)); }

// --- text ---

void SetText(Control& control, const WCHAR* text) {
  const std::u16string_view view = text != nullptr ? text : u"";
  if (control.mode == TM_RICHTEXT && IsRtf(view)) {
    ReadRtf(view, control.document);
  } else {
    ReadText(view, control.document);
  }
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

// --- streams ---

// All that the callback gives; an error of it is kept in the stream.
std::string Collect(EDITSTREAM& stream) {
  std::string bytes;
  for (;;) {
    const std::size_t length = bytes.size();
    bytes.resize(length + kPiece);
    LONG moved = 0;
    stream.dwError =
        stream.pfnCallback(stream.dwCookie, reinterpret_cast<BYTE*>(bytes.data() + length), kPiece, &moved);
    bytes.resize(length + static_cast<std::size_t>(std::clamp<LONG>(moved, 0, kPiece)));
    if (stream.dwError != 0 || moved <= 0) return bytes;
  }
}

void GiveAll(EDITSTREAM& stream, std::string_view bytes) {
  while (!bytes.empty()) {
    const LONG size = static_cast<LONG>(std::min<std::size_t>(bytes.size(), kPiece));
    LONG moved = 0;
    stream.dwError =
        stream.pfnCallback(stream.dwCookie, reinterpret_cast<BYTE*>(const_cast<char*>(bytes.data())), size, &moved);
    if (stream.dwError != 0 || moved <= 0) return;
    bytes.remove_prefix(static_cast<std::size_t>(std::min(moved, size)));
  }
}

std::u16string Decode(const std::string& bytes, bool isUnicode) {
  std::u16string text(bytes.size() / (isUnicode ? sizeof(WCHAR) : 1), u'\0');
  if (isUnicode) {
    std::memcpy(text.data(), bytes.data(), text.size() * sizeof(WCHAR));
  } else {
    const int length = MultiByteToWideChar(CP_ACP, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                           static_cast<int>(text.size()));
    text.resize(static_cast<std::size_t>(std::max(length, 0)));
  }
  return text;
}

std::string Encode(std::u16string_view text, bool isUnicode) {
  if (isUnicode) return std::string(reinterpret_cast<const char*>(text.data()), text.size() * sizeof(WCHAR));
  std::string bytes(text.size() * 4, '\0');
  const int length = WideCharToMultiByte(CP_ACP, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                         static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(std::max(length, 0)));
  return bytes;
}

LRESULT StreamIn(Control& control, WPARAM format, EDITSTREAM& stream) {
  const std::string bytes = Collect(stream);
  if ((format & SF_RTF) != 0) {
    if (control.mode != TM_RICHTEXT || !IsRtf(bytes)) {
      stream.dwError = ERROR_INVALID_DATA;
      return 0;
    }
    ReadRtf(bytes, control.document);
  } else {
    const std::u16string text = Decode(bytes, (format & SF_UNICODE) != 0);
    ReadText(std::u16string_view(text).substr(0, control.limit), control.document);
  }
  return static_cast<LRESULT>(control.Text().size());
}

LRESULT StreamOut(const Control& control, WPARAM format, EDITSTREAM& stream) {
  std::string bytes;
  if ((format & SF_RTF) != 0) {
    WriteRtf(control.document, bytes);
  } else {
    bytes = Encode(control.Text(), (format & SF_UNICODE) != 0);
  }
  GiveAll(stream, bytes);
  return static_cast<LRESULT>(bytes.size());
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
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

// What a message answers when memory runs out; the document is empty then.
LRESULT Fail(Control* control, UINT message, LPARAM lParam) {
  if (control != nullptr) control->document = Document();
  if (message == EM_STREAMIN || message == EM_STREAMOUT)
    reinterpret_cast<EDITSTREAM*>(lParam)->dwError = ERROR_NOT_ENOUGH_MEMORY;
  return 0;
}

}  // namespace

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
    return Fail(control, message, lParam);
  }
}

}  // namespace rich
}  // namespace platform
