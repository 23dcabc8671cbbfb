#include "tests/display/x_client.h"

#include <X11/Xatom.h>
#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <dlfcn.h>
#include <poll.h>

#include <algorithm>
#include <atomic>
#include <cstring>
#include <stdexcept>
#include <thread>

namespace test {

struct XClient::State {
  ::Display* server = XOpenDisplay(nullptr);
  ::Window root = None, own = None;

  // The extension for input, as far as it is called.
  int (*fakeMotion)(::Display*, int, int, int, unsigned long) = nullptr;
  int (*fakeButton)(::Display*, unsigned, int, unsigned long) = nullptr;
  int (*fakeKey)(::Display*, unsigned, int, unsigned long) = nullptr;

  std::thread server_of_text;
  std::atomic<bool> ends{false};

  State() {
    if (server == nullptr) throw std::runtime_error("there is no X server");
    root = DefaultRootWindow(server);
    own = XCreateSimpleWindow(server, root, 1200, 900, 20, 20, 0, 0, 0);
    if (void* module = dlopen("libXtst.so.6", RTLD_NOW | RTLD_LOCAL)) {
      fakeMotion = reinterpret_cast<decltype(fakeMotion)>(dlsym(module, "XTestFakeMotionEvent"));
      fakeButton = reinterpret_cast<decltype(fakeButton)>(dlsym(module, "XTestFakeButtonEvent"));
      fakeKey = reinterpret_cast<decltype(fakeKey)>(dlsym(module, "XTestFakeKeyEvent"));
    }
  }
  ~State() {
    ends = true;
    if (server_of_text.joinable()) server_of_text.join();
    XCloseDisplay(server);
  }

  // The name that window managers show.
  std::string NameOf(::Window window) const {
    Atom type = None;
    int format = 0;
    unsigned long count = 0, rest = 0;
    unsigned char* value = nullptr;
    XGetWindowProperty(server, window, XInternAtom(server, "_NET_WM_NAME", False), 0, 1000, False, AnyPropertyType,
                       &type, &format, &count, &rest, &value);
    const std::string name = value != nullptr ? std::string(reinterpret_cast<char*>(value), count) : std::string();
    if (value != nullptr) XFree(value);
    return name;
  }
  ::Window Find(const std::string& title, ::Window from) const {
    if (NameOf(from) == title) return from;
    ::Window ignored, parent, *children = nullptr, found = None;
    unsigned count = 0;
    if (XQueryTree(server, from, &ignored, &parent, &children, &count) == 0) return None;
    for (unsigned i = 0; i < count && found == None; ++i) found = Find(title, children[i]);
    if (children != nullptr) XFree(children);
    return found;
  }
  ::Window Find(const std::string& title) const { return Find(title, root); }
  // The window at the pointer that says it takes drops, found from the outside in as every source of a drag does.
  ::Window FindDropTarget() const {
    const Atom aware = XInternAtom(server, "XdndAware", False);
    ::Window window = root, inside = root, found = None;
    while (inside != None && found == None) {
      window = inside;
      ::Window ignored;
      int x, y;
      unsigned buttons;
      if (!XQueryPointer(server, window, &ignored, &inside, &x, &y, &x, &y, &buttons)) return None;
      if (inside != None && HasProperty(inside, aware)) found = inside;
    }
    return found;
  }
  bool HasProperty(::Window window, Atom name) const {
    int count = 0;
    Atom* names = XListProperties(server, window, &count);
    const bool has = std::find(names, names + count, name) != names + count;
    if (names != nullptr) XFree(names);
    return has;
  }
};

XClient::XClient() : m_state(std::make_unique<State>()) {}
XClient::~XClient() = default;

bool XClient::CanType() const { return m_state->fakeMotion && m_state->fakeButton && m_state->fakeKey; }

// --- hands ---

void XClient::Move(POINT point) {
  m_state->fakeMotion(m_state->server, -1, point.x, point.y, 0);
  XSync(m_state->server, False);
}

void XClient::Button(int button, bool isDown) {
  m_state->fakeButton(m_state->server, static_cast<unsigned>(button), isDown, 0);
  XSync(m_state->server, False);
}

void XClient::Click(POINT point) {
  Move(point);
  Button(1, true);
  Button(1, false);
}

void XClient::Key(const char* name, bool isDown) {
  const KeyCode code = XKeysymToKeycode(m_state->server, XStringToKeysym(name));
  m_state->fakeKey(m_state->server, code, isDown, 0);
  XSync(m_state->server, False);
}

// --- eyes ---

std::vector<std::uint32_t> XClient::Pixels(const RECT& rect) {
  const unsigned width = static_cast<unsigned>(rect.right - rect.left),
                 height = static_cast<unsigned>(rect.bottom - rect.top);
  XImage* image = XGetImage(m_state->server, m_state->root, rect.left, rect.top, width, height, AllPlanes, ZPixmap);
  std::vector<std::uint32_t> pixels;
  if (image == nullptr) return pixels;
  for (int y = 0; y < image->height; ++y)
    for (int x = 0; x < image->width; ++x)
      pixels.push_back(static_cast<std::uint32_t>(XGetPixel(image, x, y)) & 0xFFFFFF);
  XDestroyImage(image);
  return pixels;
}

// --- windows ---

std::vector<std::string> XClient::Titles() {
  std::vector<std::string> titles;
  ::Window ignored, parent, *children = nullptr;
  unsigned count = 0;
  XQueryTree(m_state->server, m_state->root, &ignored, &parent, &children, &count);
  for (unsigned i = 0; i < count; ++i) {
    XWindowAttributes attributes{};
    XGetWindowAttributes(m_state->server, children[i], &attributes);
    const std::string title = m_state->NameOf(children[i]);
    if (attributes.map_state == IsViewable && !title.empty()) titles.push_back(title);
  }
  if (children != nullptr) XFree(children);
  return titles;
}

bool XClient::HasWindow(const std::string& title) { return m_state->Find(title) != None; }

void XClient::Place(const std::string& title, const RECT& rect) {
  XMoveResizeWindow(m_state->server, m_state->Find(title), rect.left, rect.top,
                    static_cast<unsigned>(rect.right - rect.left), static_cast<unsigned>(rect.bottom - rect.top));
  XSync(m_state->server, False);
}

void XClient::AskToClose(const std::string& title) {
  ::Display* server = m_state->server;
  XEvent event{};
  event.xclient.type = ClientMessage;
  event.xclient.window = m_state->Find(title);
  event.xclient.message_type = XInternAtom(server, "WM_PROTOCOLS", False);
  event.xclient.format = 32;
  event.xclient.data.l[0] = static_cast<long>(XInternAtom(server, "WM_DELETE_WINDOW", False));
  event.xclient.data.l[1] = CurrentTime;
  XSendEvent(server, event.xclient.window, False, NoEventMask, &event);
  XSync(server, False);
}

void XClient::TakeKeyboard() {
  XMapWindow(m_state->server, m_state->own);
  XSync(m_state->server, False);
  XSetInputFocus(m_state->server, m_state->own, RevertToPointerRoot, CurrentTime);
  XSync(m_state->server, False);
}

void XClient::GiveKeyboard(const std::string& title) {
  XSetInputFocus(m_state->server, m_state->Find(title), RevertToPointerRoot, CurrentTime);
  XSync(m_state->server, False);
}

bool XClient::HasKeyboardOwner() {
  ::Window focus = None;
  int revert = 0;
  XGetInputFocus(m_state->server, &focus, &revert);
  return focus != None && focus != PointerRoot && focus != m_state->root;
}

// --- drag and drop ---

namespace {

// The source's side of XDND, version 5.
class DragSource {
 public:
  DragSource(::Display* server, ::Window own, ::Window target, const std::string& uris)
      : m_server(server), m_own(own), m_target(target), m_uris(uris) {}

  // Like file managers it offers more kinds than fit the first message, which then stand in a property.
  bool Run(POINT point) {
    Enter(point);
    const bool isWelcome = WaitFor("XdndStatus") & 1;
    if (!isWelcome) return Tell("XdndLeave", 0, 0, 0, 0), false;
    Tell("XdndDrop", 0, CurrentTime, 0, 0);
    return WaitFor("XdndFinished") & 1;
  }
  void Enter(POINT point) {
    XSetSelectionOwner(m_server, Name("XdndSelection"), m_own, CurrentTime);
    const Atom kinds[] = {Name("application/x-files"), Name("application/x-icons"), Name("text/uri-list"),
                          Name("text/plain")};
    XChangeProperty(m_server, m_own, Name("XdndTypeList"), XA_ATOM, 32, PropModeReplace,
                    reinterpret_cast<const unsigned char*>(kinds), 4);
    Tell("XdndEnter", 5L << 24 | 1, static_cast<long>(kinds[0]), static_cast<long>(kinds[1]),
         static_cast<long>(kinds[2]));
    Tell("XdndPosition", 0, point.x << 16 | point.y, CurrentTime, static_cast<long>(Name("XdndActionCopy")));
  }

 private:
  Atom Name(const char* name) const { return XInternAtom(m_server, name, False); }
  void Tell(const char* message, long a, long b, long c, long d) {
    XEvent event{};
    event.xclient.type = ClientMessage;
    event.xclient.window = m_target;
    event.xclient.message_type = Name(message);
    event.xclient.format = 32;
    const long data[] = {static_cast<long>(m_own), a, b, c, d};
    std::copy_n(data, 5, event.xclient.data.l);
    XSendEvent(m_server, m_target, False, NoEventMask, &event);
    XFlush(m_server);
  }
  // The flags of the target's message; 0 when it does not come. Meanwhile the target asks for the files.
  long WaitFor(const char* message) {
    for (int tries = 0; tries < 250; ++tries) {
      pollfd waiting{ConnectionNumber(m_server), POLLIN, 0};
      poll(&waiting, 1, 20);
      while (XPending(m_server) > 0) {
        XEvent event;
        XNextEvent(m_server, &event);
        if (event.type == SelectionRequest) Serve(event.xselectionrequest);
        const bool isIt = event.type == ClientMessage && event.xclient.message_type == Name(message);
        if (isIt) return event.xclient.data.l[1];
      }
    }
    return 0;
  }
  void Serve(const XSelectionRequestEvent& request) {
    XChangeProperty(m_server, request.requestor, request.property, request.target, 8, PropModeReplace,
                    reinterpret_cast<const unsigned char*>(m_uris.data()), static_cast<int>(m_uris.size()));
    XEvent answer{};
    answer.xselection = {
        SelectionNotify,  0,           False, m_server, request.requestor, request.selection, request.target,
        request.property, request.time};
    XSendEvent(m_server, request.requestor, False, NoEventMask, &answer);
    XFlush(m_server);
  }

  ::Display* m_server;
  ::Window m_own, m_target;
  std::string m_uris;
};

}  // namespace

bool XClient::Drop(POINT point, const std::string& uris) {
  Move(point);
  const ::Window target = m_state->FindDropTarget();
  return target != None && DragSource(m_state->server, m_state->own, target, uris).Run(point);
}

void XClient::BeginDragAndGo(POINT point) {
  Move(point);
  const ::Window brief = XCreateSimpleWindow(m_state->server, m_state->root, 1200, 900, 20, 20, 0, 0, 0);
  DragSource(m_state->server, brief, m_state->FindDropTarget(), "").Enter(point);
  XDestroyWindow(m_state->server, brief);
  XSync(m_state->server, False);
}

// --- the clipboard ---

void XClient::AskForText() {
  ::Display* server = m_state->server;
  XConvertSelection(server, XInternAtom(server, "CLIPBOARD", False), XInternAtom(server, "UTF8_STRING", False),
                    XInternAtom(server, "ANSWER", False), m_state->own, CurrentTime);
  XSync(server, False);
}

bool XClient::Answer(std::string* text) {
  XEvent event;
  if (!XCheckTypedEvent(m_state->server, SelectionNotify, &event)) return false;
  text->clear();
  Atom type = None;
  int format = 0;
  unsigned long count = 0, rest = 0;
  unsigned char* value = nullptr;
  XGetWindowProperty(m_state->server, m_state->own, XInternAtom(m_state->server, "ANSWER", False), 0, 1000, True,
                     AnyPropertyType, &type, &format, &count, &rest, &value);
  if (value != nullptr) {
    text->assign(reinterpret_cast<char*>(value), count);
    XFree(value);
  }
  return true;
}

void XClient::OfferText(const std::string& text) {
  ::Display* server = m_state->server;
  const Atom clipboard = XInternAtom(server, "CLIPBOARD", False), utf8 = XInternAtom(server, "UTF8_STRING", False);
  XSetSelectionOwner(server, clipboard, m_state->own, CurrentTime);
  XSync(server, False);
  m_state->server_of_text = std::thread([this, server, utf8, text] {
    while (!m_state->ends) {
      pollfd waiting{ConnectionNumber(server), POLLIN, 0};
      poll(&waiting, 1, 20);
      XEvent event;
      while (XPending(server) > 0) {
        XNextEvent(server, &event);
        if (event.type != SelectionRequest) continue;
        const XSelectionRequestEvent& request = event.xselectionrequest;
        XEvent answer{};
        answer.xselection.type = SelectionNotify;
        answer.xselection.requestor = request.requestor;
        answer.xselection.selection = request.selection;
        answer.xselection.target = request.target;
        answer.xselection.time = request.time;
        answer.xselection.property = request.target == utf8 ? request.property : None;
        if (request.target == utf8) {
          XChangeProperty(server, request.requestor, request.property, utf8, 8, PropModeReplace,
                          reinterpret_cast<const unsigned char*>(text.data()), static_cast<int>(text.size()));
        }
        XSendEvent(server, request.requestor, False, NoEventMask, &answer);
        XFlush(server);
      }
    }
  });
}

}  // namespace test
