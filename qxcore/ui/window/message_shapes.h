// The shapes of message handlers: which arguments a handler takes, and how they lie in wParam and lParam.
//
// A shape has a number from 1 to 52, which stands in the entry of a message map. Numbers 2, 4, 47, 49 and 50
// are shapes of command handlers; an entry with one of them handles no window message. Every shape calls the
// handler through `call` and returns its result as an LRESULT.
//
// Handles of windows, menus and device contexts are turned into objects; where no permanent object exists, the
// object is temporary and lives at least until the handler has returned.
// Threads: nothing here is changed at run time.
#pragma once

#include <cstdint>
#include <type_traits>

#include "qxcore/graphics/rect.h"
#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SCmdUI;
class SDC;
class SMenu;
class SScrollBar;
class SWnd;

// The objects of handles in message arguments; null for a null handle.
struct QXCORE_API SMsgObjects {
  static SWnd* Window(std::intptr_t handle);           // the permanent object, or a temporary one
  static SDC* Context(std::intptr_t handle);           // the same for a device context
  static SMenu* Menu(std::intptr_t handle);            // the same for a menu
  static SScrollBar* ScrollBar(std::intptr_t handle);  // null as well for a window that is no scroll bar
};

// A pointer in a message argument, which becomes what the handler wants.
struct SMsgPointer {
  std::intptr_t m_value;  // the argument
  // The argument as a pointer to any type of object.
  template <class T>
  operator T*() const {
    return reinterpret_cast<T*>(m_value);
  }
};

// The arguments of a message, read as the shapes need them.
struct SMsgArguments {
  WPARAM m_wParam;  // as they
  LPARAM m_lParam;  // were sent

  UINT WLow() const { return static_cast<UINT>(m_wParam & 0xFFFF); }               // words of wParam
  UINT WHigh() const { return static_cast<UINT>(m_wParam >> 16 & 0xFFFF); }        // without a sign
  UINT LLow() const { return static_cast<UINT>(m_lParam & 0xFFFF); }               // words of lParam
  UINT LHigh() const { return static_cast<UINT>(m_lParam >> 16 & 0xFFFF); }        // without a sign
  int X() const { return static_cast<std::int16_t>(LLow()); }                      // coordinates in lParam
  int Y() const { return static_cast<std::int16_t>(LHigh()); }                     // with their sign
  SPoint Point() const { return SPoint(X(), Y()); }                                // both
  UINT W() const { return static_cast<UINT>(m_wParam); }                           // wParam as a number
  int WInt() const { return static_cast<int>(m_wParam); }                          // the same with its sign
  SMsgPointer WPointer() const { return {static_cast<std::intptr_t>(m_wParam)}; }  // wParam as a pointer
  SMsgPointer LPointer() const { return {static_cast<std::intptr_t>(m_lParam)}; }  // lParam as a pointer
  SWnd* WWindow() const { return SMsgObjects::Window(WPointer().m_value); }        // wParam as a window
  SWnd* LWindow() const { return SMsgObjects::Window(LPointer().m_value); }        // lParam as a window
};

// Turns a handler's result into that of the message.
template <class Result>
LRESULT SMsgResult(Result result) {
  if constexpr (std::is_pointer_v<Result>) {
    return reinterpret_cast<LRESULT>(result);
  } else {
    return static_cast<LRESULT>(result);
  }
}

// Calls the handler; a handler without a result gives `otherwise`.
template <class Call, class... Arguments>
LRESULT SMsgInvoke(LRESULT otherwise, Call call, Arguments... arguments) {
  if constexpr (std::is_void_v<decltype(call(arguments...))>) {
    call(arguments...);
    return otherwise;
  } else {
    return SMsgResult(call(arguments...));
  }
}

// How the shape with this number takes its arguments out of `a`. `message` is the entry's message.
template <unsigned number, UINT message, class Call>
LRESULT SMsgCallShape(Call call, const SMsgArguments& a) {
  static_assert(number >= 1 && number <= 52, "there are 52 shapes");
  // The three drawing messages want a nonzero result; other messages 0.
  constexpr LRESULT otherwise = number == 35 ? 1 : 0;
  auto invoke = [&call](auto... arguments) { return SMsgInvoke(otherwise, call, arguments...); };
  if constexpr (number == 1) return invoke(SMsgObjects::Context(a.WPointer().m_value));  // int(SDC*)
  if constexpr (number == 2) return invoke();                                            // a command
  if constexpr (number == 3) return invoke(a.WWindow(), a.LLow(), a.LHigh());            // int(SWnd*, UINT, UINT)
  if constexpr (number == 4) return invoke(a.W());                                       // a command of a range
  if constexpr (number == 5) return invoke(a.m_wParam, a.m_lParam);                      // LRESULT(WPARAM, LPARAM)
  if constexpr (number == 6) return invoke(a.W());                                       // int(UINT)
  if constexpr (number == 7) return invoke();                                            // int()
  if constexpr (number == 8) return invoke(a.WInt());                                    // int(int)
  if constexpr (number == 9) return invoke(a.Point());                                   // LRESULT(SPoint)
  if constexpr (number == 10)
    return invoke(a.WLow(), a.WHigh(), SMsgObjects::Menu(a.m_lParam));                // LRESULT(UINT, UINT, SMenu*)
  if constexpr (number == 11 || number == 12) return invoke(a.LPointer());            // int(CREATESTRUCTW*); int(T*)
  if constexpr (number == 13) return invoke(a.WInt(), static_cast<int>(a.m_lParam));  // int(int, int)
  if constexpr (number == 14) {                                                       // HBRUSH(SDC*, SWnd*, UINT)
    return invoke(SMsgObjects::Context(a.WPointer().m_value), a.LWindow(), message - WM_CTLCOLORMSGBOX);
  }
  if constexpr (number == 15) return invoke();                                          // void()
  if constexpr (number == 16) return invoke(a.WInt());                                  // void(int)
  if constexpr (number == 17) return invoke(a.W());                                     // void(UINT)
  if constexpr (number == 18) return invoke(static_cast<UINT_PTR>(a.m_wParam));         // void(UINT_PTR)
  if constexpr (number == 19) return invoke(a.WInt(), static_cast<DWORD>(a.m_lParam));  // void(int, DWORD)
  if constexpr (number == 20) return invoke(a.W(), a.LWindow());                        // void(UINT, SWnd*)
  if constexpr (number == 21)
    return invoke(a.WLow(), a.LWindow(), static_cast<int>(a.WHigh()));                 // void(UINT, SWnd*, int)
  if constexpr (number == 22) return invoke(a.WInt(), static_cast<UINT>(a.m_lParam));  // void(int, UINT)
  if constexpr (number == 23) return invoke(a.W(), a.X(), a.Y());                      // void(UINT, int, int)
  if constexpr (number == 24) return invoke(a.X(), a.Y());                             // void(int, int)
  if constexpr (number == 25) return invoke(a.W(), a.Point());                         // void(UINT, SPoint)
  if constexpr (number == 26) return invoke(a.WWindow());                              // void(SWnd*)
  if constexpr (number == 27) return invoke(a.LWindow());                              // void(SWnd*) in lParam
  if constexpr (number == 28) return invoke(a.WWindow(), a.Point());                   // void(SWnd*, SPoint)
  if constexpr (number == 29) return invoke(a.W(), a.LLow(), a.LHigh());               // void(UINT, UINT, UINT)
  if constexpr (number == 30) return invoke(a.W(), a.m_lParam);                        // void(UINT, LPARAM)
  if constexpr (number == 31) return invoke(a.W(), a.LPointer());                      // void(UINT, LPCWSTR)
  if constexpr (number == 32)
    return invoke(a.WLow(), a.WHigh(), SMsgObjects::ScrollBar(a.m_lParam));           // void(UINT, UINT, SScrollBar*)
  if constexpr (number == 33) return invoke(a.WLow(), a.WHigh());                     // void(UINT, UINT)
  if constexpr (number == 34) return invoke();                                        // UINT()
  if constexpr (number == 35 || number == 36) return invoke(a.WInt(), a.LPointer());  // void(int, T*); int(int, T*)
  if constexpr (number == 37) return invoke(a.LPointer());                            // void(T*)
  if constexpr (number == 38) {                                                       // int(UINT, short, SPoint)
    return invoke(a.WLow(), static_cast<short>(a.WHigh()), a.Point());
  }
  if constexpr (number == 39) return invoke(a.WLow(), a.LWindow(), a.WHigh());  // int(UINT, SWnd*, UINT)
  if constexpr (number == 40) return invoke(a.WLow(), a.WHigh());               // int(UINT, UINT)
  if constexpr (number == 41)
    return invoke(SMsgObjects::Menu(a.WPointer().m_value), a.LLow(),
                  static_cast<int>(a.LHigh()));                                           // void(SMenu*, UINT, int)
  if constexpr (number == 42) return invoke(a.WLow(), a.WHigh(), a.LPointer());           // void(UINT, UINT, HMENU)
  if constexpr (number == 43) return invoke(SMsgObjects::Menu(a.WPointer().m_value));     // void(SMenu*)
  if constexpr (number == 44) return invoke(a.LPointer());                                // int(LPCWSTR)
  if constexpr (number == 45) return invoke(a.WInt(), a.LPointer());                      // int(int, LPWSTR)
  if constexpr (number == 46) return invoke(SMsgObjects::Context(a.WPointer().m_value));  // void(SDC*)
  if constexpr (number == 47) return invoke(a.LPointer());                                // an update: SCmdUI*
  if constexpr (number == 48) return invoke(a.m_wParam, a.m_lParam);                      // void(WPARAM, LPARAM)
  if constexpr (number == 51) return invoke(a.W(), a.LPointer());                         // void(UINT, T*)
  if constexpr (number == 52) return invoke(a.WPointer());                                // void(T*) in wParam
  static_assert(number != 49 && number != 50, "notifications are called by SMsgCallNotify");
}

// The argument `extra` of a notification: its header, and where the result goes.
struct SMsgNotify {
  NMHDR* m_header;    // what the control sent
  LRESULT* m_result;  // never null
};

// Calls the handler of a notification, with the identifier when the entry is for a range of them.
template <bool withId, class Call>
LRESULT SMsgCallNotify(Call call, const SMsgArguments& a) {
  const SMsgNotify* notify = a.LPointer();
  if constexpr (withId) {
    return SMsgInvoke(0, call, a.W(), notify->m_header, notify->m_result);
  } else {
    return SMsgInvoke(0, call, notify->m_header, notify->m_result);
  }
}

// The shape that a message has whose handlers may have any: the one with these types; 0 when no shape has them.
template <class Handler>
inline constexpr unsigned kSMsgShapeOf = 0;
//! @cond
#define QXCORE_SHAPE(number, ...) \
  template <>                     \
  inline constexpr unsigned kSMsgShapeOf<__VA_ARGS__> = number;
QXCORE_SHAPE(1, int(SDC*))
QXCORE_SHAPE(3, int(SWnd*, UINT, UINT))
QXCORE_SHAPE(5, LRESULT(WPARAM, LPARAM))
QXCORE_SHAPE(6, int(UINT))
QXCORE_SHAPE(7, int())
QXCORE_SHAPE(8, int(int))
QXCORE_SHAPE(9, LRESULT(SPoint))
QXCORE_SHAPE(11, int(CREATESTRUCTW*))
QXCORE_SHAPE(13, int(int, int))
QXCORE_SHAPE(15, void())
QXCORE_SHAPE(16, void(int))
QXCORE_SHAPE(17, void(UINT))
QXCORE_SHAPE(20, void(UINT, SWnd*))
QXCORE_SHAPE(21, void(UINT, SWnd*, int))
QXCORE_SHAPE(23, void(UINT, int, int))
QXCORE_SHAPE(24, void(int, int))
QXCORE_SHAPE(25, void(UINT, SPoint))
QXCORE_SHAPE(26, void(SWnd*))
QXCORE_SHAPE(28, void(SWnd*, SPoint))
QXCORE_SHAPE(29, void(UINT, UINT, UINT))
QXCORE_SHAPE(31, void(UINT, LPCWSTR))
QXCORE_SHAPE(32, void(UINT, UINT, SScrollBar*))
QXCORE_SHAPE(33, void(UINT, UINT))
QXCORE_SHAPE(34, UINT())
QXCORE_SHAPE(38, int(UINT, short, SPoint))
QXCORE_SHAPE(39, int(UINT, SWnd*, UINT))
QXCORE_SHAPE(40, int(UINT, UINT))
QXCORE_SHAPE(41, void(SMenu*, UINT, int))
QXCORE_SHAPE(43, void(SMenu*))
QXCORE_SHAPE(44, int(LPCWSTR))
QXCORE_SHAPE(45, int(int, LPWSTR))
QXCORE_SHAPE(46, void(SDC*))
QXCORE_SHAPE(48, void(WPARAM, LPARAM))
#undef QXCORE_SHAPE
template <class T>
inline constexpr unsigned kSMsgShapeOf<int(T*)> = 12;
template <class T>
inline constexpr unsigned kSMsgShapeOf<void(int, T*)> = 35;
template <class T>
inline constexpr unsigned kSMsgShapeOf<int(int, T*)> = 36;
template <class T>
inline constexpr unsigned kSMsgShapeOf<void(T*)> = 37;
template <class T>
inline constexpr unsigned kSMsgShapeOf<void(UINT, T*)> = 51;
// An update handler is no handler of a window message.
template <>
inline constexpr unsigned kSMsgShapeOf<void(SCmdUI*)> = 0;

//! @endcond

// The shape and the handler type that a message has; for other messages the type alone decides.
template <UINT message>
struct SMsgRule {
  static constexpr unsigned kNumber = 0;  // any
};
//! @cond
#define QXCORE_MESSAGE(message, number, ...)    \
  template <>                                   \
  struct SMsgRule<message> {                    \
    static constexpr unsigned kNumber = number; \
    using Handler = __VA_ARGS__;                \
  };
QXCORE_MESSAGE(WM_CREATE, 11, int(CREATESTRUCTW*))
QXCORE_MESSAGE(WM_NCCREATE, 11, int(CREATESTRUCTW*))
QXCORE_MESSAGE(WM_DESTROY, 15, void())
QXCORE_MESSAGE(WM_NCDESTROY, 15, void())
QXCORE_MESSAGE(WM_CLOSE, 15, void())
QXCORE_MESSAGE(WM_CANCELMODE, 15, void())
QXCORE_MESSAGE(WM_PAINT, 15, void())
QXCORE_MESSAGE(WM_NCPAINT, 15, void())
QXCORE_MESSAGE(WM_SYSCOLORCHANGE, 15, void())
QXCORE_MESSAGE(WM_ERASEBKGND, 1, int(SDC*))
QXCORE_MESSAGE(WM_SETCURSOR, 3, int(SWnd*, UINT, UINT))
QXCORE_MESSAGE(WM_MOUSEACTIVATE, 3, int(SWnd*, UINT, UINT))
QXCORE_MESSAGE(WM_QUERYENDSESSION, 7, int())
QXCORE_MESSAGE(WM_NCACTIVATE, 8, int(int))
QXCORE_MESSAGE(WM_NCHITTEST, 9, LRESULT(SPoint))
QXCORE_MESSAGE(WM_MENUCHAR, 10, LRESULT(UINT, UINT, SMenu*))
QXCORE_MESSAGE(WM_HELP, 12, int(HELPINFO*))
QXCORE_MESSAGE(WM_CTLCOLORMSGBOX, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLOREDIT, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLORLISTBOX, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLORBTN, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLORDLG, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLORSCROLLBAR, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_CTLCOLORSTATIC, 14, HBRUSH(SDC*, SWnd*, UINT))
QXCORE_MESSAGE(WM_ENABLE, 16, void(int))
QXCORE_MESSAGE(WM_ENDSESSION, 16, void(int))
QXCORE_MESSAGE(WM_TIMER, 18, void(UINT_PTR))
QXCORE_MESSAGE(WM_ACTIVATEAPP, 19, void(int, DWORD))
QXCORE_MESSAGE(WM_ENTERIDLE, 20, void(UINT, SWnd*))
QXCORE_MESSAGE(WM_ACTIVATE, 21, void(UINT, SWnd*, int))
QXCORE_MESSAGE(WM_SHOWWINDOW, 22, void(int, UINT))
QXCORE_MESSAGE(WM_SIZE, 23, void(UINT, int, int))
QXCORE_MESSAGE(WM_DISPLAYCHANGE, 23, void(UINT, int, int))
QXCORE_MESSAGE(WM_MOVE, 24, void(int, int))
QXCORE_MESSAGE(WM_MOUSEMOVE, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_LBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_LBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_LBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_RBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_RBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_RBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_MBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_MBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_MBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCMOUSEMOVE, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCLBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCLBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCLBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCRBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCRBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCRBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCMBUTTONDOWN, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCMBUTTONUP, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_NCMBUTTONDBLCLK, 25, void(UINT, SPoint))
QXCORE_MESSAGE(WM_SETFOCUS, 26, void(SWnd*))
QXCORE_MESSAGE(WM_KILLFOCUS, 26, void(SWnd*))
QXCORE_MESSAGE(WM_CAPTURECHANGED, 27, void(SWnd*))
QXCORE_MESSAGE(WM_CONTEXTMENU, 28, void(SWnd*, SPoint))
QXCORE_MESSAGE(WM_KEYDOWN, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_KEYUP, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_CHAR, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_SYSKEYDOWN, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_SYSKEYUP, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_SYSCHAR, 29, void(UINT, UINT, UINT))
QXCORE_MESSAGE(WM_SYSCOMMAND, 30, void(UINT, LPARAM))
QXCORE_MESSAGE(WM_PARENTNOTIFY, 30, void(UINT, LPARAM))
QXCORE_MESSAGE(WM_SETTINGCHANGE, 31, void(UINT, LPCWSTR))
QXCORE_MESSAGE(WM_HSCROLL, 32, void(UINT, UINT, SScrollBar*))
QXCORE_MESSAGE(WM_VSCROLL, 32, void(UINT, UINT, SScrollBar*))
QXCORE_MESSAGE(WM_GETDLGCODE, 34, UINT())
QXCORE_MESSAGE(WM_DRAWITEM, 35, void(int, DRAWITEMSTRUCT*))
QXCORE_MESSAGE(WM_MEASUREITEM, 35, void(int, MEASUREITEMSTRUCT*))
QXCORE_MESSAGE(WM_DELETEITEM, 35, void(int, DELETEITEMSTRUCT*))
QXCORE_MESSAGE(WM_COMPAREITEM, 36, int(int, COMPAREITEMSTRUCT*))
QXCORE_MESSAGE(WM_NCCALCSIZE, 36, int(int, NCCALCSIZE_PARAMS*))
QXCORE_MESSAGE(WM_WINDOWPOSCHANGING, 37, void(WINDOWPOS*))
QXCORE_MESSAGE(WM_WINDOWPOSCHANGED, 37, void(WINDOWPOS*))
QXCORE_MESSAGE(WM_GETMINMAXINFO, 37, void(MINMAXINFO*))
QXCORE_MESSAGE(WM_MOUSEWHEEL, 38, int(UINT, short, SPoint))
QXCORE_MESSAGE(WM_VKEYTOITEM, 39, int(UINT, SWnd*, UINT))
QXCORE_MESSAGE(WM_CHARTOITEM, 39, int(UINT, SWnd*, UINT))
QXCORE_MESSAGE(WM_INITMENUPOPUP, 41, void(SMenu*, UINT, int))
QXCORE_MESSAGE(WM_MENUSELECT, 42, void(UINT, UINT, HMENU))
QXCORE_MESSAGE(WM_INITMENU, 43, void(SMenu*))
QXCORE_MESSAGE(WM_SETTEXT, 44, int(LPCWSTR))
QXCORE_MESSAGE(WM_GETTEXT, 45, int(int, LPWSTR))
QXCORE_MESSAGE(WM_GETTEXTLENGTH, 7, int())
QXCORE_MESSAGE(WM_SIZING, 51, void(UINT, RECT*))
// Reflected to the control that they are about.
QXCORE_MESSAGE(WM_DRAWITEM + 0xBC00, 37, void(DRAWITEMSTRUCT*))
QXCORE_MESSAGE(WM_MEASUREITEM + 0xBC00, 37, void(MEASUREITEMSTRUCT*))
QXCORE_MESSAGE(WM_DELETEITEM + 0xBC00, 37, void(DELETEITEMSTRUCT*))
QXCORE_MESSAGE(WM_COMPAREITEM + 0xBC00, 12, int(COMPAREITEMSTRUCT*))
QXCORE_MESSAGE(WM_VKEYTOITEM + 0xBC00, 40, int(UINT, UINT))
QXCORE_MESSAGE(WM_CHARTOITEM + 0xBC00, 40, int(UINT, UINT))
QXCORE_MESSAGE(WM_HSCROLL + 0xBC00, 33, void(UINT, UINT))
QXCORE_MESSAGE(WM_VSCROLL + 0xBC00, 33, void(UINT, UINT))
QXCORE_MESSAGE(WM_PARENTNOTIFY + 0xBC00, 30, void(UINT, LPARAM))
#undef QXCORE_MESSAGE

// WM_DROPFILES carries a handle that is a pointer type of its own.
template <>
struct SMsgRule<0x0233> {
  static constexpr unsigned kNumber = 52;
  using Handler = void;
};
//! @endcond
