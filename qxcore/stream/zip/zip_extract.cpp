// Taking one entry out of an archive.

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/quietly.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/stream/zip/internal/zip_format.h"
#include "qxcore/stream/zip/zip_file.h"
#include "qxcore/stream/zip/zip_input_stream.h"

namespace {

// An output file that goes away again unless it was finished.
class NewFile {
 public:
  explicit NewFile(const SString& path) : m_path(path), m_file(path) {}
  NewFile(const NewFile&) = delete;
  NewFile& operator=(const NewFile&) = delete;
  ~NewFile() {
    if (m_isFinished) return;
    SQuietly([this] { m_file.Close(); });
    TakeBack();
  }

  SOutputStream& Stream() { return m_file; }
  void Finish() {
    m_file.Close();
    m_isFinished = true;
  }

 private:
  void TakeBack() noexcept {
    const DWORD attributes = ::GetFileAttributesW(m_path);
    if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_DEVICE) != 0) return;
    if ((attributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0) {
      SFile::Delete(m_path);
      return;
    }
    // Without the link nobody would find what it leads to.
    SQuietly([this] { SOutputFile emptied(m_path); });
  }

  SString m_path;
  SOutputFile m_file;
  bool m_isFinished = false;
};

// An entry that was found in the archive and stands ready to be read.
class FoundEntry {
 public:
  FoundEntry(const SString& archive, const SZipEntry& told) : m_told(told), m_file(archive), m_data(m_file) {
    if (m_file.SeekPos(static_cast<unsigned long>(told.GetOffset()))) SThrowZip(nullptr);
    if (m_data.GetNextEntry() == nullptr) SThrowZip(WTEXT("invalid LOC header signature"));
  }

  // All of its data, checked against what the directory says of it.
  void CopyTo(SOutputStream& out) {
    std::int64_t size = 0;
    unsigned char bytes[16384];
    while (const unsigned long count = m_data.Read(bytes, sizeof bytes)) {
      size += count;
      if (size > m_told.GetSize()) break;
      out.Write(bytes, count);
    }
    if (size != m_told.GetSize()) SThrowZip(WTEXT("invalid entry size"));
    if (m_data.GetCRC() != m_told.GetCRC()) SThrowZip(WTEXT("invalid entry CRC"));
  }

 private:
  SZipEntry m_told;
  SInputFile m_file;
  SZipInputStream m_data;
};

}  // namespace

void SZipFile::FindEntry(const SString& name) {
  for (int found = FindFile(nullptr, 0); found != 0; found = ReadNext()) {
    if (m_entry.GetName() == name) return;
  }
  SThrowZip(WTEXT("entry not found"));
}

void SZipFile::ExtractTo(const SString& archive, const SString& entry, SOutputStream& out) {
  SZipFile directory(archive);
  directory.FindEntry(entry);
  FoundEntry(archive, directory.GetEntry()).CopyTo(out);
}

void SZipFile::ExtractFile(const SString& archive, const SString& entry, const SString& target) {
  SZipFile directory(archive);
  directory.FindEntry(entry);
  FoundEntry found(archive, directory.GetEntry());
  NewFile out(target);
  found.CopyTo(out.Stream());
  out.Finish();
}
