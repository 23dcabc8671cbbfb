#include "tools/common/unread_folder.h"

#include "qxcore/system/file/file.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

namespace {

constexpr int kLongestPath = 255;  // of a folder: a search appends a mask of four characters, and ends at 259

std::string TooLong() {
  return "the path is too long; a folder's may have " + std::to_string(kLongestPath) + " characters";
}

}  // namespace

SString FolderToSearch(const SString& given) {
  const SString whole = SFile::NormalizeDirectoryName(given);
  const bool isTooLong = whole.Length() > kLongestPath || (whole.IsEmpty() && !given.IsEmpty());
  if (isTooLong) throw Failure{TooLong(), kFailed, ShortenedPath(given)};
  if (!SFile::Exists(whole)) throw Failure{"there is no such folder", kFailed, ShortenedPath(given)};
  if (!SFile::IsDirectory(whole)) throw Failure{"it is no folder", kFailed, ShortenedPath(given)};
  return whole;
}

std::string WhyNotSearched(const SString& folder, unsigned long error) {
  return folder.Length() > kLongestPath ? TooLong() : SystemText(error);
}

std::string ShortenedPath(const SString& path) {
  constexpr int kLongest = 120, kBegin = 40, kEnd = 77;
  const SString shown = ShownPath(path);
  if (shown.Length() <= kLongest) return ToUtf8(shown);
  return ToUtf8(shown.Left(kBegin)) + "..." + ToUtf8(shown.Right(kEnd));
}
