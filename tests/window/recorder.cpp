#include "tests/window/recorder.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <map>
#include <sstream>

namespace recorder {
namespace {

struct MessageName {
  UINT message;
  const char* name;
};
#define NAME(message) {message, #message},
const MessageName kNames[] = {
    NAME(WM_NCCREATE) NAME(WM_NCCALCSIZE) NAME(WM_CREATE) NAME(WM_SIZE) NAME(WM_MOVE) NAME(WM_PARENTNOTIFY)
        NAME(WM_SHOWWINDOW) NAME(WM_WINDOWPOSCHANGING) NAME(WM_WINDOWPOSCHANGED) NAME(WM_ACTIVATEAPP)
            NAME(WM_NCACTIVATE) NAME(WM_ACTIVATE) NAME(WM_SETFOCUS) NAME(WM_KILLFOCUS) NAME(WM_NCPAINT)
                NAME(WM_ERASEBKGND) NAME(WM_PAINT) NAME(WM_GETMINMAXINFO) NAME(WM_DESTROY) NAME(WM_NCDESTROY)
                    NAME(WM_ENABLE) NAME(WM_CANCELMODE) NAME(WM_CAPTURECHANGED) NAME(WM_STYLECHANGING)
                        NAME(WM_STYLECHANGED) NAME(WM_SETTEXT) NAME(WM_SYSCOMMAND) NAME(WM_CLOSE) NAME(WM_QUERYOPEN)
                            NAME(WM_SETCURSOR) NAME(WM_MOUSEACTIVATE) NAME(WM_CHILDACTIVATE) NAME(WM_LBUTTONDOWN)
                                NAME(WM_LBUTTONUP) NAME(WM_LBUTTONDBLCLK) NAME(WM_RBUTTONDOWN) NAME(WM_RBUTTONUP)
                                    NAME(WM_CONTEXTMENU) NAME(WM_MOUSEMOVE) NAME(WM_MOUSEWHEEL) NAME(WM_NCLBUTTONDOWN)
                                        NAME(WM_NCMOUSEMOVE) NAME(WM_NCHITTEST) NAME(WM_ENTERSIZEMOVE)
                                            NAME(WM_EXITSIZEMOVE) NAME(WM_SIZING) NAME(WM_MOVING) NAME(WM_INITMENU)
                                                NAME(WM_INITMENUPOPUP) NAME(WM_UNINITMENUPOPUP) NAME(WM_MENUSELECT)
                                                    NAME(WM_ENTERMENULOOP) NAME(WM_EXITMENULOOP) NAME(WM_ENTERIDLE)
                                                        NAME(WM_COMMAND) NAME(WM_INITDIALOG) NAME(WM_NEXTDLGCTL)
                                                            NAME(WM_CTLCOLORDLG) NAME(WM_KEYDOWN) NAME(WM_KEYUP)
                                                                NAME(WM_CHAR) NAME(WM_SYSKEYDOWN) NAME(WM_SYSKEYUP)
                                                                    NAME(WM_SYSCHAR) NAME(WM_TIMER) NAME(WM_USER)
                                                                        NAME(WM_HSCROLL) NAME(WM_VSCROLL)};
#undef NAME

std::map<HWND, std::string> g_windows;
std::string g_text;
int g_depth = 0;
bool g_isOn = false;
bool g_isLookingForMessages = false;

std::string Narrow(LPCWSTR text) {
  std::string narrow;
  for (; text != nullptr && *text != 0; ++text) narrow += static_cast<char>(*text);
  return narrow;
}

std::string Who(HWND window) {
  if (window == nullptr) return "none";
  const auto found = g_windows.find(window);
  if (found != g_windows.end()) return found->second;
  WCHAR name[32] = {};
  GetClassNameW(window, name, 32);
  return "<" + Narrow(name) + ">";
}

// Messages about icons, input methods and palettes, questions of painting for the caption, and the private ones
// are left out; so are hit tests, idle notifications and what comes of the mouse's resting place, which depend on the
// display. A WM_CANCELMODE that arrives while the queue is looked at is the display's, too: Wine sends it when the
// X server's word that a window lost the input focus comes so late that the window is active again.
bool IsListed(UINT message, LPARAM lParam) {
  if (message == WM_CANCELMODE && g_isLookingForMessages) return false;
  if (message == WM_MOUSEMOVE || message == WM_NCMOUSEMOVE) return false;
  if (message == WM_SETCURSOR && (HIWORD(lParam) == WM_MOUSEMOVE || HIWORD(lParam) == WM_NCMOUSEMOVE)) return false;
  for (const MessageName& each : kNames)
    if (each.message == message) return message != WM_NCHITTEST && message != WM_CTLCOLORDLG && message != WM_ENTERIDLE;
  return false;
}

const char* NameOf(UINT message) {
  for (const MessageName& each : kNames)
    if (each.message == message) return each.name;
  return "?";
}

template <class... Values>
std::string Format(const char* format, Values... values) {
  char buffer[200];
  std::snprintf(buffer, sizeof buffer, format, values...);
  return buffer;
}

std::string PlaceText(const WINDOWPOS& place, bool isDone) {
  constexpr UINT kPublic = SWP_NOSIZE | SWP_NOMOVE | SWP_FRAMECHANGED | SWP_SHOWWINDOW | SWP_HIDEWINDOW;
  std::string text = Format(" flags %02x", place.flags & kPublic);
  if (isDone || !(place.flags & SWP_NOMOVE)) text += Format(" at %d,%d", place.x, place.y);
  if (isDone || !(place.flags & SWP_NOSIZE)) text += Format(" size %dx%d", place.cx, place.cy);
  return text;
}

std::string Words(WPARAM wParam) { return Format(" %x", static_cast<unsigned>(wParam)); }

std::string Details(UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_WINDOWPOSCHANGING:
    case WM_WINDOWPOSCHANGED:
      return PlaceText(*reinterpret_cast<WINDOWPOS*>(lParam), message == WM_WINDOWPOSCHANGED);
    case WM_PARENTNOTIFY:
      return Words(LOWORD(wParam)) + (LOWORD(wParam) < WM_MOUSEFIRST ? " " + Who(reinterpret_cast<HWND>(lParam)) : "");
    case WM_SETFOCUS:
    case WM_KILLFOCUS:
      return " " + Who(reinterpret_cast<HWND>(wParam));
    case WM_ACTIVATE:
      return Words(wParam) + " " + Who(reinterpret_cast<HWND>(lParam));
    case WM_CAPTURECHANGED:
      return " " + Who(reinterpret_cast<HWND>(lParam));
    case WM_SIZE:
    case WM_MOVE:
      return Words(wParam) + Format(" %d,%d", static_cast<short>(LOWORD(lParam)), static_cast<short>(HIWORD(lParam)));
    case WM_SETCURSOR:
    case WM_MOUSEACTIVATE:
      return " " + Who(reinterpret_cast<HWND>(wParam)) + Format(" %x %x", LOWORD(lParam), HIWORD(lParam));
    case WM_NCCALCSIZE:
    case WM_SHOWWINDOW:
    case WM_ENABLE:
    case WM_NCACTIVATE:
    case WM_ACTIVATEAPP:
    case WM_SYSCOMMAND:
    case WM_MENUSELECT:
    case WM_ENTERIDLE:
    case WM_SIZING:
    case WM_CHAR:
    case WM_SYSCHAR:
    case WM_KEYDOWN:
    case WM_KEYUP:
    case WM_SYSKEYDOWN:
    case WM_TIMER:
    case WM_USER:
      return Words(wParam);
    case WM_COMMAND:
      return Words(wParam) + " " + Who(reinterpret_cast<HWND>(lParam));
    case WM_INITDIALOG:
      return " " + Who(reinterpret_cast<HWND>(wParam));
    case WM_LBUTTONDOWN:
    case WM_LBUTTONUP:
    case WM_LBUTTONDBLCLK:
    case WM_MOUSEMOVE:
      return Words(wParam) + Format(" %d,%d", static_cast<short>(LOWORD(lParam)), static_cast<short>(HIWORD(lParam)));
    default:
      return "";
  }
}

void Note(const std::string& text) {
  if (g_isOn) g_text += std::string(static_cast<std::size_t>(g_depth) * 2, ' ') + text + "\n";
}

LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (IsListed(message, lParam)) Note(Who(window) + " " + NameOf(message) + Details(message, wParam, lParam));
  ++g_depth;
  const LRESULT result = DefWindowProcW(window, message, wParam, lParam);
  --g_depth;
  return result;
}

LRESULT CALLBACK Hook(int code, WPARAM wParam, LPARAM lParam) {
  static constexpr const char* kCodes[] = {"MOVESIZE", "MINMAX",       "QS",         "CREATEWND",  "DESTROYWND",
                                           "ACTIVATE", "CLICKSKIPPED", "KEYSKIPPED", "SYSCOMMAND", "SETFOCUS"};
  if (code == HCBT_CREATEWND) {
    const LPCWSTR name = reinterpret_cast<CBT_CREATEWNDW*>(lParam)->lpcs->lpszName;
    if (name != nullptr && !IS_INTRESOURCE(name) && *name != 0)
      g_windows[reinterpret_cast<HWND>(wParam)] = Narrow(name);
  }
  const std::string who =
      code == HCBT_SYSCOMMAND ? Format("%x", static_cast<unsigned>(wParam)) : Who(reinterpret_cast<HWND>(wParam));
  const bool isOwn = who.find("IME") == std::string::npos && who.find("OleMain") == std::string::npos;
  // Documented as coming before the window follows the mouse; Wine calls it when that is over.
  if (code == HCBT_MOVESIZE) return CallNextHookEx(nullptr, code, wParam, lParam);
  if (code >= 0 && code <= HCBT_SETFOCUS && isOwn) {
    std::string text = std::string("hook ") + kCodes[code] + " " + who;
    if (code == HCBT_SETFOCUS) text += " from " + Who(reinterpret_cast<HWND>(lParam));
    Note(text);
  }
  return CallNextHookEx(nullptr, code, wParam, lParam);
}

std::string ExpectedFile(const std::string& name) {
  return std::string(QXCORE_SOURCE_DIR) + "/tests/window/expected/" + name + ".txt";
}

}  // namespace

void RegisterRecorder() {
  static ATOM atom = 0;
  if (atom != 0) return;
  WNDCLASSW wanted{};
  wanted.style = CS_DBLCLKS;
  wanted.lpfnWndProc = &Procedure;
  wanted.hInstance = GetModuleHandleW(nullptr);
  wanted.hCursor = LoadCursorW(nullptr, IDC_ARROW);
  wanted.hbrBackground = reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(COLOR_WINDOW + 1));
  wanted.lpszClassName = WTEXT("Recorder");
  atom = RegisterClassW(&wanted);
}

HWND Make(LPCWSTR name, DWORD style, HWND parent, RECT rect, DWORD exStyle) {
  RegisterRecorder();
  return CreateWindowExW(exStyle, WTEXT("Recorder"), name, style, rect.left, rect.top, rect.right - rect.left,
                         rect.bottom - rect.top, parent, nullptr, GetModuleHandleW(nullptr), nullptr);
}

Record::Record() : m_hook(SetWindowsHookExW(WH_CBT, &Hook, nullptr, GetCurrentThreadId())) {
  g_text.clear();
  g_windows.clear();
  g_depth = 0;
  g_isOn = true;
}

Record::~Record() {
  g_isOn = false;
  UnhookWindowsHookEx(m_hook);
}

void Record::Title(const char* title) { g_text += std::string("== ") + title + "\n"; }

void Record::Name(HWND window, const std::string& name) { g_windows[window] = name; }

const std::string& Record::Text() const { return g_text; }

void NoteDialog(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  if (IsListed(message, lParam)) Note(Who(dialog) + " " + NameOf(message) + Details(message, wParam, lParam));
}

static bool TakeMessage(MSG* message) {
  g_isLookingForMessages = true;
  const bool isThere = PeekMessageW(message, nullptr, 0, 0, PM_REMOVE) != 0;
  g_isLookingForMessages = false;
  return isThere;
}

void Pump() {
  MSG message;
  while (TakeMessage(&message)) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

#ifdef _WIN32
// Without a window manager, and with one, Wine's windows behave differently unless it manages them itself.
static bool IsUnmanagedWine() {
  WCHAR value[8] = {};
  DWORD size = sizeof value;
  return RegGetValueW(HKEY_CURRENT_USER, WTEXT("Software\\Wine\\X11 Driver"), WTEXT("Managed"), RRF_RT_REG_SZ, nullptr,
                      value, &size) == ERROR_SUCCESS &&
         (value[0] == 'N' || value[0] == 'n');
}
#endif

void ExpectRecord(const std::string& name, const std::string& text) {
  const std::string file = ExpectedFile(name);
#ifdef _WIN32
  if (!IsUnmanagedWine()) GTEST_SKIP() << "SKIPPED: Wine's value \"Managed\" is not N, so the lists may differ";
  if (std::getenv("QXCORE_EXPECTED") != nullptr) {
    std::ofstream(file, std::ios::binary) << text;
    return;
  }
#endif
  std::ifstream in(file, std::ios::binary);
  ASSERT_TRUE(in) << "missing: " << file;
  std::stringstream expected;
  expected << in.rdbuf();
  std::istringstream one(expected.str()), other(text);
  std::string wanted, found, title;
  for (int line = 1;; ++line) {
    const bool hasWanted = static_cast<bool>(std::getline(one, wanted));
    const bool hasFound = static_cast<bool>(std::getline(other, found));
    if (!hasWanted && !hasFound) return;
    if (wanted.starts_with("==")) title = wanted;
    ASSERT_EQ(hasWanted ? wanted : "(nothing)", hasFound ? found : "(nothing)")
        << file << ":" << line << " in " << title << "\nthe whole record:\n"
        << text;
  }
}

}  // namespace recorder
