// qxtool zip extract: the data of one entry.

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/progress_bar.h"
#include "tools/common/replacement_file.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/zip_archive.h"

namespace {

constexpr const char* kStandard = "-";

// Shows how much was written, and ends when the user wants that.
class WatchedOutput : public FileOutput {
 public:
  WatchedOutput(std::FILE* file, const std::string& name) : FileOutput(file), m_progress(name) {}
  using FileOutput::Write;
  unsigned long Write(const void* bytes, unsigned long count) override {
    if (console::Interrupted()) throw SEIOAbortedException();
    m_done += count;
    m_progress.SetPos(m_done);
    return FileOutput::Write(bytes, count);
  }

 private:
  ProgressBar m_progress;
  std::uint64_t m_done = 0;
};

void ExtractTo(const ZipOptions& options, std::FILE* file) {
  WatchedOutput output(file, options.archive);
  SZipFile::ExtractTo(console::NameOf(options.archive), FromUtf8(options.entry), output);
  output.Flush();
}

}  // namespace

int ExtractZipEntry(const ZipOptions& options) try {
  OpenDirectory(options.archive);  // says what is wrong with it, before a file is made
  if (options.out == kStandard) {
    ExtractTo(options, stdout);
  } else {
    ReplacementFile target(console::NativeOf(options.out));
    ExtractTo(options, target.File());
    target.Commit(false);
  }
  return kDone;
} catch (const SEZipException&) {
  throw Failure{"entry \"" + options.entry + "\": " + ReasonOfCurrentException(), kFailed, options.archive};
} catch (...) {
  FailAt(options.out);
}
