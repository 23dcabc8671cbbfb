#include "tools/qxtool/zip_archive.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/text_source.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/entry_path.h"

namespace {

constexpr const char* kCutDirectory = "the central directory ends too early or cannot be read";

std::string Quoted(const SString& name) { return "entry \"" + Shown(name) + "\""; }

}  // namespace

std::unique_ptr<SZipFile> OpenDirectory(const std::string& path) {
  try {
    return std::make_unique<SZipFile>(console::NameOf(path));
  } catch (const SEZipException& e) {
    const std::string text = ToUtf8(e.GetText());
    throw Failure{text.empty() ? "cannot be opened or read" : text, kFailed, path};
  }
}

bool FindNextEntry(SZipFile& directory) {
  if (directory.FindNextFileW()) return true;
  if (!directory.HasFailed()) return false;
  const std::string text = ToUtf8(directory.GetFailure());
  throw Failure{text.empty() ? kCutDirectory : text};
}

ZipArchive::ZipArchive(const std::string& path) : m_path(path), m_progress(path), m_file(OpenInput(path, m_progress)) {
  const std::unique_ptr<SZipFile> directory = OpenDirectory(path);
  m_entries.reserve(directory->GetCount());
  for (bool found = directory->FindFile(nullptr, 0) != 0; found; found = FindNextEntry(*directory))
    m_entries.push_back(directory->GetEntry());
  std::stable_sort(m_entries.begin(), m_entries.end(),
                   [](const SZipEntry& a, const SZipEntry& b) { return a.GetOffset() < b.GetOffset(); });
  m_stream = std::make_unique<SZipInputStream>(*m_file);
}

const SZipEntry* ZipArchive::Next() {
  try {
    m_met = m_stream->GetNextEntry();
  } catch (...) {
    const bool isHere = m_next < m_entries.size() && m_entries[m_next].GetOffset() == m_stream->GetPosition();
    FailAtEntry(isHere ? &m_entries[m_next] : nullptr);
  }
  m_size = 0;
  m_entry = m_met != nullptr ? Match(*m_met) : nullptr;
  if (m_met == nullptr && m_next < m_entries.size())
    Fail(Quoted(m_entries[m_next].GetName()) + " is in the central directory, but not met in sequence");
  return m_entry;
}

const SZipEntry* ZipArchive::Match(const SZipEntry& met) {
  if (m_next == m_entries.size() || m_entries[m_next].GetOffset() != met.GetOffset())
    Fail(Quoted(met.GetName()) + " is met in sequence, but not in the central directory");
  const SZipEntry& told = m_entries[m_next++];
  if (told.GetName() != met.GetName())
    Fail(Quoted(met.GetName()) + " has another name in the central directory, \"" + Shown(told.GetName()) + "\"");
  return &told;
}

unsigned long ZipArchive::Read(void* buffer, unsigned long count) {
  try {
    if (console::Interrupted()) throw SEIOAbortedException();
    const unsigned long got = m_stream->Read(buffer, count);
    m_size += static_cast<std::int64_t>(got);
    return got;
  } catch (...) {
    FailAtEntry(m_entry);
  }
}

void ZipArchive::CheckRead() const {
  const char* wrong = nullptr;
  if (m_stream->GetCRC() != m_entry->GetCRC() || m_met->GetCRC() != m_entry->GetCRC()) wrong = "CRC";
  if (m_met->GetCompressedSize() != m_entry->GetCompressedSize()) wrong = "compressed size";
  if (m_size != m_entry->GetSize()) wrong = "size";
  if (wrong != nullptr) Fail(Quoted(m_entry->GetName()) + ": its " + wrong + " is not what the central directory says");
}

void ZipArchive::Fail(const std::string& text) const { throw Failure{text, kFailed, m_path}; }

void ZipArchive::FailAtEntry(const SZipEntry* entry) const {
  // The user's wish comes out of the readers as damage, for they cannot tell one failure of a source from another.
  if (console::Interrupted()) throw SEIOAbortedException();
  if (const int error = m_file->GetError()) Fail(std::string("Cannot be read: ") + std::strerror(error));
  const std::string reason = ReasonOfCurrentException();
  Fail(entry != nullptr ? Quoted(entry->GetName()) + ": " + reason : reason);
}
