// Handlers that fit, and, one for each case, handlers that do not. See compile_fail.py.

#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/window.h"

class SProbe : public SWnd {
 public:
  int OnCreate(CREATESTRUCTW* create);
  void OnSize(UINT kind, int width, int height);
  void OnVoid();
  void OnText(LPCWSTR text);
  LRESULT OnAny(WPARAM wParam, LPARAM lParam);
  void OnUpdate(SCmdUI* ui);
  void OnHeader(NMHDR* header, LRESULT* result);
  QXCORE_DECLARE_MESSAGE_MAP()
};

static UINT g_registered;
constexpr SMsgEntry kFits[] = {
    on<WM_CREATE, &SProbe::OnCreate>(), on<WM_SIZE, &SProbe::OnSize>(),          on<WM_SIZE, &SProbe::OnAny>(),
    on<WM_USER + 1, &SProbe::OnVoid>(), command<7, &SProbe::OnVoid>(),           update<7, &SProbe::OnUpdate>(),
    notify<7, -2, &SProbe::OnHeader>(), reflected<WM_HSCROLL, &SProbe::OnAny>(),
};
const SMsgEntry g_byName = registered<&g_registered, &SProbe::OnAny>();
static_assert(kFits[0].m_signature.m_number == 11 && kFits[1].m_signature.m_number == 23);

#ifdef CASE_WRONG_RESULT  // does not fit the message
constexpr SMsgEntry kWrong = on<WM_CREATE, &SProbe::OnText>();
#endif
#ifdef CASE_WRONG_ARGUMENTS  // does not fit the message
constexpr SMsgEntry kWrong = on<WM_SIZE, &SProbe::OnVoid>();
#endif
#ifdef CASE_SHAPE_OF_ANOTHER_MESSAGE  // does not fit the message
constexpr SMsgEntry kWrong = on<WM_DESTROY, &SProbe::OnSize>();
#endif
#ifdef CASE_UPDATE_HANDLER_OF_A_MESSAGE  // does not fit the message
constexpr SMsgEntry kWrong = on<WM_USER, &SProbe::OnUpdate>();
#endif
#ifdef CASE_COMMAND_AS_MESSAGE  // use command<>
constexpr SMsgEntry kWrong = on<WM_COMMAND, &SProbe::OnAny>();
#endif
#ifdef CASE_COMMAND_WITH_ARGUMENTS  // handler of a command is void()
constexpr SMsgEntry kWrong = command<7, &SProbe::OnAny>();
#endif
#ifdef CASE_UPDATE_WITHOUT_UI  // an update handler is void(SCmdUI*)
constexpr SMsgEntry kWrong = update<7, &SProbe::OnVoid>();
#endif
#ifdef CASE_RANGE_DOWNWARD  // a range goes upward
constexpr SMsgEntry kWrong = command_range<9, 7, &SProbe::OnVoid>();
#endif
#ifdef CASE_REGISTERED_NUMBER  // use registered<>
constexpr SMsgEntry kWrong = on<0xC123, &SProbe::OnAny>();
#endif
#ifdef CASE_REGISTERED_SHAPE  // registered message is LRESULT(WPARAM, LPARAM)
const SMsgEntry g_wrong = registered<&g_registered, &SProbe::OnVoid>();
#endif
#ifdef CASE_NOT_REFLECTED  // this message is not reflected
constexpr SMsgEntry kWrong = reflected<WM_CTLCOLOREDIT, &SProbe::OnAny>();
#endif
#ifdef CASE_NOTIFY_SHAPE  // a notification's handler is
constexpr SMsgEntry kWrong = notify<7, -2, &SProbe::OnVoid>();
#endif
