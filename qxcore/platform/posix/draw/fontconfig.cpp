#include "qxcore/platform/posix/draw/fontconfig.h"

#include <dlfcn.h>
#include <strings.h>

#include <memory>
#include <mutex>

namespace draw::fontconfig {

namespace {

// The published interface, as far as it is called.
struct Library {
  using Pattern = void;
  using CharSet = void;
  void* (*initialize)();
  Pattern* (*create)();
  void (*destroy)(Pattern*);
  int (*addString)(Pattern*, const char*, const unsigned char*);
  int (*addInteger)(Pattern*, const char*, int);
  int (*addCharSet)(Pattern*, const char*, const CharSet*);
  CharSet* (*createSet)();
  void (*destroySet)(CharSet*);
  int (*addChar)(CharSet*, unsigned int);
  int (*hasChar)(const CharSet*, unsigned int);
  int (*substitute)(void*, Pattern*, int);
  void (*defaults)(Pattern*);
  Pattern* (*match)(void*, Pattern*, int*);
  int (*getString)(const Pattern*, const char*, int, unsigned char**);
  int (*getInteger)(const Pattern*, const char*, int, int*);
  int (*getCharSet)(const Pattern*, const char*, int, CharSet**);
  void* config = nullptr;
  bool loaded = false;

  Library() {
    void* module = dlopen("libfontconfig.so.1", RTLD_NOW | RTLD_LOCAL);
    if (!module) return;
    loaded = Bind(module, initialize, "FcInitLoadConfigAndFonts") && Bind(module, create, "FcPatternCreate") &&
             Bind(module, destroy, "FcPatternDestroy") && Bind(module, addString, "FcPatternAddString") &&
             Bind(module, addInteger, "FcPatternAddInteger") && Bind(module, addCharSet, "FcPatternAddCharSet") &&
             Bind(module, createSet, "FcCharSetCreate") && Bind(module, destroySet, "FcCharSetDestroy") &&
             Bind(module, addChar, "FcCharSetAddChar") && Bind(module, hasChar, "FcCharSetHasChar") &&
             Bind(module, substitute, "FcConfigSubstitute") && Bind(module, defaults, "FcDefaultSubstitute") &&
             Bind(module, match, "FcFontMatch") && Bind(module, getString, "FcPatternGetString") &&
             Bind(module, getInteger, "FcPatternGetInteger") && Bind(module, getCharSet, "FcPatternGetCharSet");
    if (loaded) config = initialize();
    loaded = config != nullptr;
  }

  template <class F>
  static bool Bind(void* module, F& function, const char* name) {
    function = reinterpret_cast<F>(dlsym(module, name));
    return function != nullptr;
  }
};

std::mutex g_lock;

const Library& TheLibrary() {
  static const Library library;
  return library;
}

constexpr int kBold = 200, kRegular = 80, kItalic = 100, kMonospaced = 100;
constexpr int kMatchPattern = 0;

std::string Text(const Library& library, void* pattern, const char* name) {
  unsigned char* text = nullptr;
  return library.getString(pattern, name, 0, &text) == 0 && text ? reinterpret_cast<char*>(text) : std::string();
}

int Number(const Library& library, void* pattern, const char* name, int otherwise) {
  int value;
  return library.getInteger(pattern, name, 0, &value) == 0 ? value : otherwise;
}

// Completes a request, which it ends, and calls read(match) with the best font.
template <class F>
FontFile Match(const Library& library, void* request, F read) {
  library.substitute(library.config, request, kMatchPattern);
  library.defaults(request);
  int result = 0;
  void* found = library.match(library.config, request, &result);
  library.destroy(request);
  const std::unique_ptr<void, void (*)(void*)> end(found, library.destroy);
  return found ? read(found) : FontFile();
}

FontFile FileOf(const Library& library, void* found) {
  return {Text(library, found, "file"), Text(library, found, "family"), Number(library, found, "index", 0), false,
          false};
}

}  // namespace

FontFile Named(const std::string& family, bool bold, bool italic) {
  std::lock_guard guard(g_lock);
  const Library& library = TheLibrary();
  if (!library.loaded) return FontFile();
  void* request = library.create();
  library.addString(request, "family", reinterpret_cast<const unsigned char*>(family.c_str()));
  library.addInteger(request, "weight", bold ? kBold : kRegular);
  library.addInteger(request, "slant", italic ? kItalic : 0);
  return Match(library, request, [&](void* found) {
    FontFile file = FileOf(library, found);
    bool generic = family == "sans-serif" || family == "monospace";
    if (!generic && strcasecmp(file.family.c_str(), family.c_str()) != 0) return FontFile();
    file.embolden = bold && Number(library, found, "weight", kRegular) < kBold - 20;
    file.slant = italic && Number(library, found, "slant", 0) == 0;
    return file;
  });
}

FontFile With(char32_t character, bool fixed) {
  std::lock_guard guard(g_lock);
  const Library& library = TheLibrary();
  if (!library.loaded) return FontFile();
  void* request = library.create();
  void* set = library.createSet();
  library.addChar(set, character);
  library.addCharSet(request, "charset", set);
  if (fixed) library.addInteger(request, "spacing", kMonospaced);
  library.destroySet(set);
  return Match(library, request, [&](void* found) {
    void* has = nullptr;
    if (library.getCharSet(found, "charset", 0, &has) != 0 || !library.hasChar(has, character)) return FontFile();
    return FileOf(library, found);
  });
}

}  // namespace draw::fontconfig
