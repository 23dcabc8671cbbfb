// The functions that make the entries of message maps. A handler whose shape does not fit its message does not
// compile, and an entry needs no code at start-up.
// ```cpp
// class SNoteView : public SView {
//  public:
//   int OnCreate(CREATESTRUCTW* create);
//   void OnLButtonDown(UINT flags, SPoint point);
//   void OnClear();
//   void OnUpdateClear(SCmdUI* ui);
//   QXCORE_DECLARE_MESSAGE_MAP()
// };
// QXCORE_IMPLEMENT_MESSAGE_MAP(SNoteView, SView,
//   on<WM_CREATE, &SNoteView::OnCreate>(),
//   on<WM_LBUTTONDOWN, &SNoteView::OnLButtonDown>(),
//   command<ID_CLEAR, &SNoteView::OnClear>(),
//   update<ID_CLEAR, &SNoteView::OnUpdateClear>())
// ```
// A handler may be inherited; one of several overloads is chosen with a static_cast. Which handlers a message
// takes stands in message_shapes.h; LRESULT(WPARAM, LPARAM) fits every window message.
// Threads: nothing here is changed at run time.
#pragma once

#include "qxcore/ui/window/message_map.h"
#include "qxcore/ui/window/message_shapes.h"

//! @cond
// The class and the function type of a handler.
template <class Member>
struct SMsgMember;
template <class C, class R, class... A>
struct SMsgMember<R (C::*)(A...)> {
  using Class = C;
  using Handler = R(A...);
};
template <class C, class R, class... A>
struct SMsgMember<R (C::*)(A...) const> : SMsgMember<R (C::*)(A...)> {};
template <class C, class R, class... A>
struct SMsgMember<R (C::*)(A...) noexcept> : SMsgMember<R (C::*)(A...)> {};
template <class C, class R, class... A>
struct SMsgMember<R (C::*)(A...) const noexcept> : SMsgMember<R (C::*)(A...)> {};

template <auto handler>
using SMsgClassOf = typename SMsgMember<decltype(handler)>::Class;
template <auto handler>
using SMsgHandlerOf = typename SMsgMember<decltype(handler)>::Handler;

// A handler together with its object. The object's own class is no field, so that classes of an anonymous namespace
// may have message maps without a warning.
template <auto handler>
struct SMsgBound {
  SCmdTarget* m_target;
  template <class... Arguments>
  auto operator()(Arguments... arguments) const {
    return (static_cast<SMsgClassOf<handler>*>(m_target)->*handler)(arguments...);
  }
};

// An ordinary function that unpacks the arguments and calls the member function.
template <UINT message, unsigned number, auto handler>
LRESULT SMsgThunk(SCmdTarget* target, WPARAM wParam, LPARAM lParam) {
  const SMsgBound<handler> call{target};
  if constexpr (number == 49 || number == 50) {
    return SMsgCallNotify<number == 50>(call, SMsgArguments{wParam, lParam});
  } else {
    return SMsgCallShape<number, message>(call, SMsgArguments{wParam, lParam});
  }
}

// The number of the handler's shape for the message; 0 when it does not fit.
template <UINT message, class Handler>
consteval unsigned SMsgNumber() {
  using Rule = SMsgRule<message>;
  if constexpr (std::is_same_v<Handler, LRESULT(WPARAM, LPARAM)>) {
    return 5;
  } else if constexpr (Rule::kNumber == 0) {
    return kSMsgShapeOf<Handler>;
  } else if constexpr (Rule::kNumber == 52) {
    return kSMsgShapeOf<Handler> == 37 ? 52 : 0;
  } else {
    return std::is_same_v<Handler, typename Rule::Handler> ? Rule::kNumber : 0;
  }
}

template <UINT message, unsigned number, auto handler>
consteval SMsgEntry SMsgMakeEntry(int code, UINT firstId, UINT lastId) {
  return {message, static_cast<std::uint32_t>(code), firstId, lastId, {number}, &SMsgThunk<message, number, handler>};
}

//! @endcond

// A window message.
template <UINT message, auto handler>
consteval SMsgEntry on() {
  static_assert(message < kSMsgRegistered, "use registered<> for a message that is registered by name");
  static_assert(message != WM_COMMAND && message != WM_NOTIFY, "use command<>, control<> or notify<>");
  constexpr unsigned number = SMsgNumber<message, SMsgHandlerOf<handler>>();
  static_assert(number != 0, "the handler's shape does not fit the message; see message_shapes.h");
  return SMsgMakeEntry<message, number, handler>(0, 0, 0);
}

// A message registered by name. The variable is filled with the number from RegisterWindowMessageW before the
// first message comes; the handler is LRESULT(WPARAM, LPARAM).
template <const UINT* variable, auto handler>
consteval SMsgEntry registered() {
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, LRESULT(WPARAM, LPARAM)>,
                "the handler of a registered message is LRESULT(WPARAM, LPARAM)");
  SMsgEntry entry = SMsgMakeEntry<kSMsgRegistered, 5, handler>(0, 0, 0);
  entry.m_signature.m_registered = variable;
  return entry;
}

// The notification `code` that a control with this identifier sends by WM_COMMAND; void().
template <UINT id, int code, auto handler>
consteval SMsgEntry control() {
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void()>, "the handler of a command is void()");
  return SMsgMakeEntry<WM_COMMAND, 2, handler>(code, id, id);
}

// A command of a menu, an accelerator or a button: the notification 0.
template <UINT id, auto handler>
consteval SMsgEntry command() {
  return control<id, 0, handler>();
}

// All commands of a range, both ends included; void(UINT id).
template <UINT firstId, UINT lastId, auto handler>
consteval SMsgEntry command_range() {
  static_assert(firstId <= lastId, "a range goes upward");
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void(UINT)>, "the handler of a range is void(UINT)");
  return SMsgMakeEntry<WM_COMMAND, 4, handler>(0, firstId, lastId);
}

// The state of a command's menu item or button, for one command or for a range; void(SCmdUI*).
template <UINT id, auto handler>
consteval SMsgEntry update() {
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void(SCmdUI*)>, "an update handler is void(SCmdUI*)");
  return SMsgMakeEntry<WM_COMMAND, 47, handler>(kSMsgUpdate, id, id);
}
template <UINT firstId, UINT lastId, auto handler>
consteval SMsgEntry update_range() {
  static_assert(firstId <= lastId, "a range goes upward");
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void(SCmdUI*)>, "an update handler is void(SCmdUI*)");
  return SMsgMakeEntry<WM_COMMAND, 47, handler>(kSMsgUpdate, firstId, lastId);
}

// The shape of a notification's handler: void(NMHDR*, LRESULT*), or void(UINT id, NMHDR*, LRESULT*).
template <class Handler>
inline constexpr unsigned kSMsgNotifyShape = 0;
template <>
inline constexpr unsigned kSMsgNotifyShape<void(NMHDR*, LRESULT*)> = 49;
template <>
inline constexpr unsigned kSMsgNotifyShape<void(UINT, NMHDR*, LRESULT*)> = 50;

// The notification `code` that controls send by WM_NOTIFY, from one identifier or from a range.
template <UINT firstId, UINT lastId, int code, auto handler>
consteval SMsgEntry notify_range() {
  static_assert(firstId <= lastId, "a range goes upward");
  constexpr unsigned number = kSMsgNotifyShape<SMsgHandlerOf<handler>>;
  static_assert(number != 0, "a notification's handler is void(NMHDR*, LRESULT*), or the same after a UINT");
  return SMsgMakeEntry<WM_NOTIFY, number, handler>(code & 0xFFFF, firstId, lastId);
}
template <UINT id, int code, auto handler>
consteval SMsgEntry notify() {
  return notify_range<id, id, code, handler>();
}

// A notification that its parent offers back to the control itself: one of the messages that are reflected.
template <UINT message, auto handler>
consteval SMsgEntry reflected() {
  static_assert(message == WM_DRAWITEM || message == WM_MEASUREITEM || message == WM_DELETEITEM ||
                    message == WM_VKEYTOITEM || message == WM_CHARTOITEM || message == WM_COMPAREITEM ||
                    message == WM_HSCROLL || message == WM_VSCROLL || message == WM_PARENTNOTIFY,
                "this message is not reflected");
  return on<message + kSMsgReflected, handler>();
}
// The control's own notification by WM_COMMAND; void().
template <int code, auto handler>
consteval SMsgEntry reflected_command() {
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void()>, "the handler of a command is void()");
  return SMsgMakeEntry<WM_COMMAND + kSMsgReflected, 2, handler>(code, 0, 0);
}
// The control's own notification by WM_NOTIFY; void(NMHDR*, LRESULT*).
template <int code, auto handler>
consteval SMsgEntry reflected_notify() {
  static_assert(std::is_same_v<SMsgHandlerOf<handler>, void(NMHDR*, LRESULT*)>,
                "a notification's handler is void(NMHDR*, LRESULT*)");
  return SMsgMakeEntry<WM_NOTIFY + kSMsgReflected, 49, handler>(code & 0xFFFF, 0, 0);
}
