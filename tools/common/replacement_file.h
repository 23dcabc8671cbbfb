// A file that takes the place of another one only when all of it has been written.
//
// The content goes into a temporary file beside the target, which is renamed over the target by
// Commit; before that, and after any failure, the target is as it was. A link stays a link: the file
// that it leads to is replaced. What is no plain file (a device, a pipe) cannot be replaced and is
// written directly.
#pragma once

#include <cstdio>
#include <filesystem>
#include <string>

class ReplacementFile {
 public:
  // Whether the content is on the disk when Commit comes back, or whenever the system likes.
  enum class Durability { kOnDisk, kLater };

  // `target` is a path of the system. Throws Failure when the target's folder does not let itself be written.
  explicit ReplacementFile(const std::string& target, Durability durability = Durability::kOnDisk);
  ReplacementFile(const ReplacementFile&) = delete;
  ReplacementFile& operator=(const ReplacementFile&) = delete;
  // Removes the temporary file unless it was committed.
  ~ReplacementFile();

  // What to write to; owned by this object.
  std::FILE* File() { return m_file; }

  // Hands the content over and puts it in the target's place. With `ifChanged` a target that has
  // the same bytes already is left alone. Throws Failure.
  void Commit(bool ifChanged);

 private:
  void Close();

  Durability m_durability;
  std::filesystem::path m_target;
  std::filesystem::path m_temporary;  // empty when the target is written directly
  std::FILE* m_file = nullptr;
};
