// Reads a document into a string, each byte as the character of its value.
#pragma once

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "qxcore/string/string.h"

inline std::string ReadFileBytes(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  if (!file) {
    std::fprintf(stderr, "cannot read %s\n", path.string().c_str());
    std::exit(2);
  }
  return std::string(std::istreambuf_iterator<char>(file), {});
}

inline SString Widen(std::string_view bytes) {
  std::basic_string<WCHAR> text;
  for (const char byte : bytes) text += static_cast<WCHAR>(static_cast<unsigned char>(byte));
  return SString(SStringView(text));
}

inline SString ReadRtfFile(const std::filesystem::path& path) { return Widen(ReadFileBytes(path)); }
