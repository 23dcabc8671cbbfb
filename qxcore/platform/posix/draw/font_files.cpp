#include "qxcore/platform/posix/draw/font_files.h"

#include <unistd.h>

#include <strings.h>
#include <algorithm>
#include <array>
#include <cstdlib>
#include <sstream>
#include <vector>

#include "qxcore/platform/posix/draw/fontconfig.h"

namespace draw {

namespace {

// The families that are opened by file, so that no settings of the user change a result. Files: regular, bold,
// italic, both.
struct Family {
  const char* name;
  std::array<const char*, 4> files;
};

constexpr Family kFamilies[] = {
    {"Liberation Sans",
     {"LiberationSans-Regular.ttf", "LiberationSans-Bold.ttf", "LiberationSans-Italic.ttf",
      "LiberationSans-BoldItalic.ttf"}},
    {"Liberation Serif",
     {"LiberationSerif-Regular.ttf", "LiberationSerif-Bold.ttf", "LiberationSerif-Italic.ttf",
      "LiberationSerif-BoldItalic.ttf"}},
    {"Liberation Mono",
     {"LiberationMono-Regular.ttf", "LiberationMono-Bold.ttf", "LiberationMono-Italic.ttf",
      "LiberationMono-BoldItalic.ttf"}},
    {"DejaVu Sans", {"DejaVuSans.ttf", "DejaVuSans-Bold.ttf", "DejaVuSans-Oblique.ttf", "DejaVuSans-BoldOblique.ttf"}},
    {"DejaVu Serif",
     {"DejaVuSerif.ttf", "DejaVuSerif-Bold.ttf", "DejaVuSerif-Italic.ttf", "DejaVuSerif-BoldItalic.ttf"}},
    {"DejaVu Sans Mono",
     {"DejaVuSansMono.ttf", "DejaVuSansMono-Bold.ttf", "DejaVuSansMono-Oblique.ttf", "DejaVuSansMono-BoldOblique.ttf"}},
};

// Names of other systems' fonts, and the families that have their widths or their purpose.
struct Substitute {
  const char *name, *family;
};

constexpr Substitute kSubstitutes[] = {
    {"Arial", "Liberation Sans"},        {"Helvetica", "Liberation Sans"},
    {"Helv", "Liberation Sans"},         {"MS Sans Serif", "Liberation Sans"},
    {"MS Shell Dlg", "Liberation Sans"}, {"MS Shell Dlg 2", "Liberation Sans"},
    {"Tahoma", "Liberation Sans"},       {"Segoe UI", "Liberation Sans"},
    {"System", "Liberation Sans"},       {"Times New Roman", "Liberation Serif"},
    {"Times", "Liberation Serif"},       {"Tms Rmn", "Liberation Serif"},
    {"MS Serif", "Liberation Serif"},    {"Courier New", "Liberation Mono"},
    {"Courier", "Liberation Mono"},      {"Fixedsys", "Liberation Mono"},
    {"Consolas", "Liberation Mono"},
};

// The folders where distributions keep these files; QXCORE_FONT_PATH names others before them.
std::vector<std::string> MakeFolders() {
  std::vector<std::string> folders;
  if (const char* own = std::getenv("QXCORE_FONT_PATH")) {
    std::stringstream parts(own);
    for (std::string part; std::getline(parts, part, ':');) folders.push_back(part);
  }
  for (const char* folder :
       {"/usr/share/fonts/truetype/liberation2", "/usr/share/fonts/truetype/liberation",
        "/usr/share/fonts/truetype/dejavu", "/usr/share/fonts/liberation", "/usr/share/fonts/liberation-sans",
        "/usr/share/fonts/liberation-serif", "/usr/share/fonts/liberation-mono", "/usr/share/fonts/dejavu",
        "/usr/share/fonts/dejavu-sans-fonts", "/usr/share/fonts/dejavu-serif-fonts",
        "/usr/share/fonts/dejavu-sans-mono-fonts", "/usr/share/fonts/TTF", "/usr/local/share/fonts"})
    folders.push_back(folder);
  return folders;
}

std::string PathOf(const char* file) {
  static const std::vector<std::string> folders = MakeFolders();
  for (const std::string& folder : folders) {
    std::string path = folder + "/" + file;
    if (access(path.c_str(), R_OK) == 0) return path;
  }
  return std::string();
}

bool SameName(const std::string& a, const char* b) { return strcasecmp(a.c_str(), b) == 0; }

std::string FaceOf(const LOGFONTW& description) {
  std::string name;
  for (int i = 0; i < LF_FACESIZE && description.lfFaceName[i]; ++i) {
    WCHAR unit = description.lfFaceName[i];
    name += unit < 0x80 ? static_cast<char>(unit) : '?';
  }
  return name;
}

FontFile InFamily(const Family& family, bool bold, bool italic) {
  std::string path = PathOf(family.files[(bold ? 1 : 0) + (italic ? 2 : 0)]);
  if (!path.empty()) return {path, family.name, 0, false, false};
  path = PathOf(family.files[0]);
  return {path, family.name, 0, bold, italic};
}

FontFile OfFamily(const std::string& name, bool bold, bool italic) {
  for (const Family& family : kFamilies) {
    if (SameName(name, family.name)) return InFamily(family, bold, italic);
  }
  return FontFile();
}

}  // namespace

FontFile FindFontFile(const LOGFONTW& description) {
  bool bold = description.lfWeight >= FW_SEMIBOLD, italic = description.lfItalic != 0;
  std::string face = FaceOf(description);
  FontFile file = OfFamily(face, bold, italic);
  for (const Substitute& substitute : kSubstitutes) {
    if (file.path.empty() && SameName(face, substitute.name)) file = OfFamily(substitute.family, bold, italic);
  }
  if (file.path.empty() && !face.empty()) file = fontconfig::Named(face, bold, italic);
  if (!file.path.empty()) return file;
  bool fixed = (description.lfPitchAndFamily & 3) == FIXED_PITCH;
  for (const char* family :
       {fixed ? "Liberation Mono" : "Liberation Sans", fixed ? "DejaVu Sans Mono" : "DejaVu Sans"}) {
    file = OfFamily(family, bold, italic);
    if (!file.path.empty()) return file;
  }
  return fontconfig::Named(fixed ? "monospace" : "sans-serif", bold, italic);
}

FontFile FindFontFileWith(char32_t character, const FontFile& like) {
  return fontconfig::With(character, like.family.find("Mono") != std::string::npos);
}

}  // namespace draw
