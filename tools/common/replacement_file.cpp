#include "tools/common/replacement_file.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <random>
#include <string>
#include <system_error>

#include "tools/common/console.h"
#include "tools/common/failure.h"

namespace fs = std::filesystem;

namespace {

// The file behind a chain of links; the last one may lead to a file that does not exist yet.
fs::path BehindLinks(fs::path path) {
  constexpr int kMostLinks = 40;
  std::error_code error;
  for (int i = 0; i < kMostLinks && fs::is_symlink(fs::symlink_status(path, error)); ++i) {
    fs::path next = fs::read_symlink(path, error);
    if (error) break;
    path = next.is_absolute() ? next : path.parent_path() / next;
  }
  return path;
}

// The name is cut, so that there is room for the rest where the target's name is as long as can be.
fs::path TemporaryBeside(const fs::path& target) {
  constexpr std::size_t kLongest = 200;
  std::random_device random;
  for (;;) {
    fs::path name = target.parent_path() / target.filename().native().substr(0, kLongest);
    name += ".qx" + std::to_string(random()) + ".tmp";
    std::error_code error;
    if (!fs::exists(fs::symlink_status(name, error))) return name;
  }
}

bool IsSameContent(const fs::path& a, const fs::path& b) {
  std::error_code error;
  if (fs::file_size(a, error) != fs::file_size(b, error) || error) return false;
  std::ifstream first(a, std::ios::binary), second(b, std::ios::binary);
  std::array<char, 65536> left, right;
  while (first && second) {
    first.read(left.data(), left.size());
    second.read(right.data(), right.size());
    if (first.gcount() != second.gcount()) return false;
    if (std::memcmp(left.data(), right.data(), static_cast<std::size_t>(first.gcount())) != 0) return false;
  }
  return first.eof() && second.eof();
}

[[noreturn]] void Refuse(const char* what, const std::string& why) { throw Failure{std::string(what) + ": " + why}; }

}  // namespace

ReplacementFile::ReplacementFile(const std::string& target, Durability durability)
    : m_durability(durability), m_target(BehindLinks(console::PathOf(target))) {
  std::error_code error;
  fs::file_status status = fs::status(m_target, error);
  if (fs::is_directory(status)) Refuse("Cannot open for writing", "it is a folder");
  bool isDirect = fs::exists(status) && !fs::is_regular_file(status);
  if (!isDirect) m_temporary = TemporaryBeside(m_target);
  // Before the content is there, so that nobody reads it who could not read the old one.
  m_file = isDirect ? console::OpenForWriting(m_target) : console::OpenNew(m_temporary, fs::exists(status));
  if (m_file == nullptr) {
    m_temporary.clear();
    Refuse("Cannot open for writing", std::strerror(errno));
  }
  if (isDirect) return;
  console::RemoveWhenKilled(&m_temporary);
  if (fs::exists(status)) fs::permissions(m_temporary, status.permissions(), error);
}

ReplacementFile::~ReplacementFile() {
  if (m_file != nullptr) std::fclose(m_file);
  if (!m_temporary.empty()) {
    std::error_code error;
    fs::remove(m_temporary, error);
    console::RemoveWhenKilled(nullptr);
  }
}

void ReplacementFile::Close() {
  bool isWritten = m_durability == Durability::kOnDisk ? console::Synchronise(m_file) : std::fflush(m_file) == 0;
  int why = errno;
  if (std::fclose(m_file) != 0 && isWritten) {
    isWritten = false;
    why = errno;
  }
  m_file = nullptr;
  if (!isWritten) Refuse("Write failed", std::strerror(why));
}

void ReplacementFile::Commit(bool ifChanged) {
  Close();
  if (m_temporary.empty() || (ifChanged && IsSameContent(m_temporary, m_target))) return;
  std::error_code error;
  fs::rename(m_temporary, m_target, error);
  if (error) Refuse("Cannot replace the file", error.message());
  m_temporary.clear();
  console::RemoveWhenKilled(nullptr);
}
