// A folder of the test's own, with the files that it needs, removed at the end.
#pragma once

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class TemporaryFolder {
 public:
  TemporaryFolder() {
    static int number = 0;
    m_path = std::filesystem::temp_directory_path() / ("qxcore-test-" + std::to_string(std::rand()) + "-" +
                                                       std::to_string(GetTick()) + "-" + std::to_string(++number));
    std::filesystem::create_directories(m_path);
  }
  ~TemporaryFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(m_path, ignored);
  }
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  // Writes a file and gives its path as the library spells it.
  SString Make(const std::string& name, const std::string& content) const {
    std::ofstream(m_path / name, std::ios::binary) << content;
    return Path(name);
  }
  std::string Content(const std::string& name) const {
    std::ifstream in(m_path / name, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  }
  SString Path(const std::string& name) const {
    SString path((m_path / name).string().c_str());
#ifndef _WIN32
    path.ReplaceAll(WTEXT("/"), WTEXT("\\"));
    path = WTEXT("C:") + path;
#endif
    return path;
  }
  const std::filesystem::path& Native() const { return m_path; }

 private:
  static long long GetTick() { return std::chrono::steady_clock::now().time_since_epoch().count(); }

  std::filesystem::path m_path;
};
