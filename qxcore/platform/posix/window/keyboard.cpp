// The road of a key from the queue to its window, and from keys to characters, by the layout of an American
// keyboard.

#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/input.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

struct CharacterKey {
  BYTE key;
  char plain, shifted;
};
constexpr CharacterKey kMarks[] = {
    {VK_OEM_1, ';', ':'},      {VK_OEM_PLUS, '=', '+'}, {VK_OEM_COMMA, ',', '<'}, {VK_OEM_MINUS, '-', '_'},
    {VK_OEM_PERIOD, '.', '>'}, {VK_OEM_2, '/', '?'},    {VK_OEM_3, '`', '~'},     {VK_OEM_4, '[', '{'},
    {VK_OEM_5, '\\', '|'},     {VK_OEM_6, ']', '}'},    {VK_OEM_7, '\'', '"'},    {VK_SPACE, ' ', ' '},
    {VK_BACK, '\b', '\b'},     {VK_TAB, '\t', '\t'},    {VK_RETURN, '\r', '\r'},  {VK_ESCAPE, 27, 27},
    {VK_MULTIPLY, '*', '*'},   {VK_ADD, '+', '+'},      {VK_SUBTRACT, '-', '-'},  {VK_DIVIDE, '/', '/'},
};
constexpr char kShiftedDigits[] = ")!@#$%^&*(";

bool IsDown(const BYTE* keys, int key) { return keys[key] & 0x80; }

// The character that a key makes; 0 for a key that makes no character.
WCHAR CharacterOf(WPARAM key, const BYTE* keys) {
  const bool shift = IsDown(keys, VK_SHIFT), control = IsDown(keys, VK_CONTROL);
  if (key >= 'A' && key <= 'Z') {
    if (control) return static_cast<WCHAR>(key - 'A' + 1);
    const bool upper = shift != static_cast<bool>(keys[VK_CAPITAL] & 1);
    return static_cast<WCHAR>(upper ? key : key - 'A' + 'a');
  }
  if (control && key == VK_RETURN) return '\n';
  if (control && key != VK_ESCAPE && key != VK_BACK) return 0;
  if (key >= '0' && key <= '9') return static_cast<WCHAR>(shift ? kShiftedDigits[key - '0'] : key);
  if (key >= VK_NUMPAD0 && key <= VK_NUMPAD9) return static_cast<WCHAR>(key - VK_NUMPAD0 + '0');
  for (const CharacterKey& mark : kMarks)
    if (mark.key == key) return static_cast<WCHAR>(shift ? mark.shifted : mark.plain);
  return 0;
}

// What the keyboard's own layout made of a key that was taken from the queue.
WCHAR TypedBy(Thread* thread, const MSG& message) {
  const Guard guard;
  const MSG& last = thread->lastKey.message;
  const bool isLast = last.message == message.message && last.wParam == message.wParam && last.time == message.time;
  return isLast ? thread->lastKey.typed : DisplayEvents::kByLayout;
}

bool IsSystemKey(const Thread* thread, const MSG& message) {
  if (message.wParam == VK_F10) return true;
  if (IsDown(thread->keys, VK_CONTROL)) return false;
  return IsDown(thread->keys, VK_MENU) || message.wParam == VK_MENU;
}

}  // namespace

// To the window with the focus; while no window has it, to the active window as a system key.
bool RouteKey(MSG* message, bool) {
  Thread* thread = CurrentThread();
  const HWND focus = GetFocus(), active = GetActiveWindow();
  const Guard guard;
  const bool isUp = message->message == WM_KEYUP;
  message->hwnd = focus != nullptr ? focus : active;
  if (message->hwnd == nullptr) return false;
  if (focus == nullptr || IsSystemKey(thread, *message)) {
    message->message = isUp ? WM_SYSKEYUP : WM_SYSKEYDOWN;
    if (IsDown(thread->keys, VK_MENU)) message->lParam |= 1 << 29;
  }
  return true;
}

// The menu key alone, or F10, opens the menu; Shift+F10 asks for a context menu; Alt+F4 closes.
LRESULT DefaultKey(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  static thread_local bool menuKeyAlone = false;
  const HWND top = GetAncestor(handle, GA_ROOT);
  switch (message) {
    case WM_KEYDOWN:
      if (wParam == VK_F10) menuKeyAlone = true;
      break;
    case WM_SYSKEYDOWN:
      menuKeyAlone = wParam == VK_MENU ? !(lParam & 1 << 30) || menuKeyAlone : wParam == VK_F10;
      if (wParam == VK_F4 && (lParam & 1 << 29)) PostMessageW(top, WM_SYSCOMMAND, SC_CLOSE, 0);
      if (wParam == VK_F10 && GetKeyState(VK_SHIFT) < 0) {
        menuKeyAlone = false;
        Send(handle, WM_CONTEXTMENU, reinterpret_cast<WPARAM>(handle), -1);
      }
      break;
    case WM_KEYUP:
    case WM_SYSKEYUP:
      if ((wParam == VK_MENU || wParam == VK_F10) && menuKeyAlone) Send(top, WM_SYSCOMMAND, SC_KEYMENU, 0);
      if (wParam == VK_APPS) Send(handle, WM_CONTEXTMENU, reinterpret_cast<WPARAM>(handle), -1);
      menuKeyAlone = false;
      break;
    default:  // WM_SYSCHAR
      menuKeyAlone = false;
      if (wParam == VK_RETURN && IsIconic(handle)) {
        PostMessageW(handle, WM_SYSCOMMAND, SC_RESTORE, 0);
      } else if ((lParam & 1 << 29) && wParam != 0) {
        if (wParam == VK_TAB || wParam == VK_ESCAPE) break;
        if (wParam == VK_SPACE && GetParent(handle) != nullptr && top != handle) {
          Send(GetParent(handle), message, wParam, lParam);
        } else {
          Send(handle, WM_SYSCOMMAND, SC_KEYMENU, static_cast<LPARAM>(wParam));
        }
      }
  }
  return 0;
}

}  // namespace platform::model

using namespace platform::model;

BOOL TranslateMessage(const MSG* message) {
  const bool isSystem = message->message == WM_SYSKEYDOWN;
  if (message->message != WM_KEYDOWN && !isSystem)
    return message->message == WM_KEYUP || message->message == WM_SYSKEYUP;
  Thread* thread = CurrentThread();
  const bool isPacket = message->wParam == VK_PACKET;
  BYTE keys[256];
  GetKeyboardState(keys);
  WCHAR character = TypedBy(thread, *message);
  if (isPacket) character = HIWORD(message->lParam);
  if (character == platform::DisplayEvents::kByLayout) character = CharacterOf(message->wParam, keys);
  if (character == 0) return TRUE;
  return OrNoMemory<BOOL>(FALSE, [&] {
    const Guard guard;
    Post(thread, message->hwnd, isSystem ? WM_SYSCHAR : WM_CHAR, character, message->lParam);
    return TRUE;
  });
}

short VkKeyScanW(WCHAR character) {
  if (character >= 'a' && character <= 'z') return static_cast<short>(character - 'a' + 'A');
  if (character >= 'A' && character <= 'Z') return static_cast<short>(character | 0x100);
  if (character >= '0' && character <= '9') return static_cast<short>(character);
  for (int digit = 0; digit < 10; ++digit)
    if (character == static_cast<WCHAR>(kShiftedDigits[digit])) return static_cast<short>(('0' + digit) | 0x100);
  for (const CharacterKey& mark : kMarks) {
    if (character == static_cast<WCHAR>(mark.plain)) return mark.key;
    if (character == static_cast<WCHAR>(mark.shifted)) return static_cast<short>(mark.key | 0x100);
  }
  if (character >= 1 && character <= 26) return static_cast<short>((character - 1 + 'A') | 0x200);
  return -1;
}

// From key to character only; scan codes are the key's own number.
UINT MapVirtualKeyW(UINT code, UINT kind) {
  if (kind != MAPVK_VK_TO_CHAR) return code;
  if (code >= 'A' && code <= 'Z') return code;
  const BYTE keys[256] = {};
  return CharacterOf(code, keys);
}
