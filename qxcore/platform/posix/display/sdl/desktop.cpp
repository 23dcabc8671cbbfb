#define SDL_MAIN_HANDLED
#include "qxcore/platform/posix/display/sdl/desktop.h"

#include <SDL.h>
#include <SDL_syswm.h>
#include <X11/Xlib.h>
#include <X11/Xresource.h>

#include <cstdlib>

namespace platform::sdl {
namespace {

// The window that a manager names on the root must name itself: else it is a leftover of one that has gone.
::Window ManagersWindow(::Display* server, ::Window where) {
  const Atom name = XInternAtom(server, "_NET_SUPPORTING_WM_CHECK", True);
  Atom type = None;
  int format = 0;
  unsigned long count = 0, rest = 0;
  unsigned char* value = nullptr;
  if (name == None || XGetWindowProperty(server, where, name, 0, 1, False, AnyPropertyType, &type, &format, &count,
                                         &rest, &value) != Success) {
    return None;
  }
  const ::Window found = count == 1 && format == 32 ? *reinterpret_cast<::Window*>(value) : None;
  if (value != nullptr) XFree(value);
  return found;
}

bool HasManager(::Display* server) {
  const ::Window named = ManagersWindow(server, DefaultRootWindow(server));
  if (named == None) return false;
  // The window may be gone; without a handler of errors the process would end.
  const auto former = XSetErrorHandler([](::Display*, XErrorEvent*) { return 0; });
  const bool isAlive = ManagersWindow(server, named) == named;
  XSync(server, False);
  XSetErrorHandler(former);
  return isAlive;
}

unsigned ChosenDpi(::Display* server) {
  const char* resources = XResourceManagerString(server);
  if (resources == nullptr) return 0;
  XrmInitialize();
  const XrmDatabase database = XrmGetStringDatabase(resources);
  char* type = nullptr;
  XrmValue value{};
  const bool isFound = XrmGetResource(database, "Xft.dpi", "Xft.Dpi", &type, &value) && value.addr != nullptr;
  const double dpi = isFound ? std::atof(value.addr) : 0;
  XrmDestroyDatabase(database);
  return dpi >= 48 && dpi <= 960 ? static_cast<unsigned>(dpi + 0.5) : 0;
}

XErrorHandler g_formerHandler = nullptr;

int OnError(::Display* server, XErrorEvent* error) {
  return error->error_code == BadWindow ? 0 : g_formerHandler(server, error);
}

// A connection beside SDL's, for questions alone.
::Display* TheServer() {
  static ::Display* const server = XOpenDisplay(nullptr);
  return server;
}

// The pointer's place, and which buttons and modifiers are held.
bool AskPointer(int* x, int* y, unsigned* held) {
  ::Display* server = TheServer();
  ::Window root = None, child = None;
  int inWindowX = 0, inWindowY = 0;
  return server != nullptr &&
         XQueryPointer(server, DefaultRootWindow(server), &root, &child, x, y, &inWindowX, &inWindowY, held);
}

}  // namespace

Desktop AskDesktop() {
  ::Display* server = TheServer();
  return server != nullptr ? Desktop{HasManager(server), ChosenDpi(server)} : Desktop{};
}

bool FindPointer(int* x, int* y) {
  unsigned held = 0;
  return AskPointer(x, y, &held);
}

bool IsModifierHeld(WORD key) {
  int x = 0, y = 0;
  unsigned held = 0;
  const unsigned mask = key == VK_SHIFT ? ShiftMask : key == VK_CONTROL ? ControlMask : Mod1Mask;
  return AskPointer(&x, &y, &held) && (held & mask) != 0;
}

void OutliveWindows() {
  if (g_formerHandler == nullptr) g_formerHandler = XSetErrorHandler(&OnError);
}

void NameWindow(SDL_Window* window, const std::string& name) {
  SDL_SysWMinfo info{};
  SDL_VERSION(&info.version);
  if (!SDL_GetWindowWMInfo(window, &info) || info.subsystem != SDL_SYSWM_X11) return;
  ::Display* server = info.info.x11.display;  // on SDL's connection the window exists by then
  XChangeProperty(server, info.info.x11.window, XInternAtom(server, "_NET_WM_NAME", False),
                  XInternAtom(server, "UTF8_STRING", False), 8, PropModeReplace,
                  reinterpret_cast<const unsigned char*>(name.data()), static_cast<int>(name.size()));
  XFlush(server);
}

}  // namespace platform::sdl
