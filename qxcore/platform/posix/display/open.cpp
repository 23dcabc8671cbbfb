// Finding and opening the display.

#include <dlfcn.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <string>

#include "qxcore/platform/posix/display/module.h"

namespace platform {
namespace {

std::string FolderOfLibrary() {
  Dl_info info{};
  if (dladdr(reinterpret_cast<const void*>(&TheDisplay), &info) == 0 || info.dli_fname == nullptr) return ".";
  const std::string path = info.dli_fname;
  const std::size_t slash = path.rfind('/');
  return slash == std::string::npos ? "." : path.substr(0, slash);
}

void* LoadModule(const std::string& name) {
  const std::string file = "/qxcore-display-" + name + ".so";
  const char* given = std::getenv("QXCORE_DISPLAY_PATH");
  const std::string folder = given != nullptr ? given : FolderOfLibrary();
  const bool isBeside = given != nullptr || access((folder + file).c_str(), F_OK) == 0;
  return dlopen((folder + (isBeside ? "" : "/qxcore11e") + file).c_str(), RTLD_NOW | RTLD_LOCAL);
}

// Null, with the reason, when the display cannot be had.
Display* OpenModule(const std::string& name, std::string* reason) {
  void* module = name.find('/') == std::string::npos ? LoadModule(name) : nullptr;
  if (module == nullptr) {
    const char* error = dlerror();
    *reason = error != nullptr ? error : "there is no such display";
    return nullptr;
  }
  const auto open = reinterpret_cast<OpenDisplayFunction>(dlsym(module, kOpenDisplayName));
  const char* why = "the module is not one of this version";
  Display* display = open != nullptr ? open(kDisplayVersion, *g_displayEvents, &why) : nullptr;
  if (display == nullptr) *reason = why;
  return display;
}

// A display that was asked for and cannot be had is said on the standard error stream; then nothing is shown.
Display* Open() {
  const char* asked = std::getenv("QXCORE_DISPLAY");
  const std::string name = asked != nullptr ? asked : "";
  if (name.empty() || name == "headless") return OpenHeadlessDisplay().release();
  std::string reason;
  if (Display* display = OpenModule(name, &reason)) return display;
  std::fprintf(stderr, "qxcore: the display '%s' cannot be opened: %s\n", name.c_str(), reason.c_str());
  return OpenHeadlessDisplay().release();
}

}  // namespace

DisplayEvents* g_displayEvents = nullptr;

Display& TheDisplay() {
  static Display* const display = Open();  // outlives every static object that has a window
  return *display;
}

}  // namespace platform
