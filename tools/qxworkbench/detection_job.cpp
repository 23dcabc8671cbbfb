#include "tools/qxworkbench/detection_job.h"

#include <filesystem>
#include <utility>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/system/file/file.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/unread_folder.h"
#include "tools/common/utf8.h"

namespace {

// Looking at all bytes of so many takes a few milliseconds on a slow machine.
constexpr std::uint64_t kLargest = 512 * 1024;

// Ends the work on a file when it is asked to.
class Cancellation : public SProgressIndicatorEx {
 public:
  void SetRange(std::uint64_t, std::uint64_t) override {}
  void SetPos(std::uint64_t position) override { m_position = position; }
  std::uint64_t GetPos() const override { return m_position; }
  bool IsCancelled() override { return m_isCancelled; }
  void Cancel() { m_isCancelled = true; }

 private:
  std::atomic<std::uint64_t> m_position = 0;
  std::atomic<bool> m_isCancelled = false;
};

// Reading from a pipe could last for ever.
bool IsPipeOrDevice(const Document& document) {
  std::error_code error;
  const std::filesystem::file_status status = std::filesystem::status(console::PathOf(document.native), error);
  return std::filesystem::exists(status) && !std::filesystem::is_regular_file(status);
}

Finding LookAtFile(const Document& document) {
  const bool hasSize = document.bytes != 0;  // so that few files are asked for their kind
  if (hasSize || !IsPipeOrDevice(document)) return LookAt(document.native, kUsualRequest);
  Finding finding;
  finding.error = "it is a pipe or a device";
  return finding;
}

SString Backslashed(const SString& folder) {
  return folder[folder.Length() - 1] == '\\' ? folder : folder + WTEXT("\\");
}

}  // namespace

// A large document and the thread that looks at it.
class DetectionJob::Large {
 public:
  Large(int number, const std::string& native, const std::function<void()>& wake) : m_number(number) {
    m_thread = std::thread([this, native, wake] {
      try {
        m_finding = LookAt(native, kUsualRequest, &m_cancellation);
      } catch (const SEIOAbortedException&) {
        m_finding.error = "cancelled";
      }
      m_isDone = true;
      wake();
    });
  }
  Large(const Large&) = delete;
  Large& operator=(const Large&) = delete;
  ~Large() {
    m_cancellation.Cancel();
    m_thread.join();
  }
  bool IsDone() const { return m_isDone; }
  int Number() const { return m_number; }
  const Finding& Result() const { return m_finding; }  // when it is done

 private:
  int m_number;
  Cancellation m_cancellation;
  Finding m_finding;
  std::atomic<bool> m_isDone = false;
  std::thread m_thread;
};

static std::string WhyOf(const SFindFailures& failures) {
  return WhyNotSearched(failures.GetFirstFolder(), failures.GetFirstError());
}

DetectionJob::DetectionJob(DocumentList& documents, std::function<void()> wake)
    : m_documents(documents), m_wake(std::move(wake)) {}

DetectionJob::~DetectionJob() { Cancel(); }

void DetectionJob::Open(const SString& folder) {
  const SString whole = FolderToSearch(folder);
  auto finder = std::make_unique<SRecurseFindFiles>();
  const int found = finder->FindFile(Backslashed(whole) + WTEXT("*"));
  const SFindFailures& failures = finder->GetFailures();
  if (!found && !failures.IsEmpty()) throw Failure{WhyOf(failures), kFailed, ShortenedPath(failures.GetFirstFolder())};
  Cancel();
  m_documents.Clear();
  m_wasCancelled = false;
  m_done = 0;
  m_lastChanged = -1;
  m_folder = whole;
  m_prefix = Backslashed(whole);
  m_finder = std::move(finder);
  m_isListing = found != 0;
  if (m_isListing) AddFound();
}

void DetectionJob::Cancel() {
  if (IsRunning()) m_wasCancelled = true;
  m_isListing = false;
  m_waiting.clear();
  m_waitingLarge.clear();
  m_large.reset();
}

void DetectionJob::Step(const TimeSlice& slice) {
  ListSome(slice);
  TakeLarge();
  while (!m_waiting.empty()) {
    LookAtNext();
    if (slice.IsOver()) break;
  }
}

// Listing comes first: it is fast, and from then on the progress is known.
void DetectionJob::ListSome(const TimeSlice& slice) {
  while (m_isListing) {
    m_isListing = m_finder->FindNextFileW() != 0;
    if (m_isListing) AddFound();
    if (slice.IsOver()) break;
  }
}

void DetectionJob::AddFound() {
  Document document;
  document.path = m_finder->GetFilePath();
  document.below = document.path.Mid(m_prefix.Length());
  document.name = ShownPath(document.below);
  document.native = SFile::ToNative(document.path);
  document.bytes = m_finder->GetLength();
  const bool isLarge = document.bytes > kLargest;
  const int number = m_documents.Add(std::move(document));
  (isLarge ? m_waitingLarge : m_waiting).push_back(number);
}

void DetectionJob::LookAtNext() {
  const int number = m_waiting.front();
  m_waiting.pop_front();
  Enter(number, LookAtFile(m_documents.At(number)));
}

void DetectionJob::TakeLarge() {
  if (m_large != nullptr && m_large->IsDone()) {
    Enter(m_large->Number(), m_large->Result());
    m_large.reset();
  }
  if (m_large != nullptr || m_waitingLarge.empty()) return;
  const int number = m_waitingLarge.front();
  m_waitingLarge.pop_front();
  m_large = std::make_unique<Large>(number, m_documents.At(number).native, m_wake);
}

void DetectionJob::Enter(int number, const Finding& finding) {
  m_documents.SetFinding(number, finding);
  m_lastChanged = number;
  ++m_done;
}

SString DetectionJob::Failures() const {
  if (m_finder == nullptr || m_finder->GetFailures().IsEmpty()) return SString();
  const SFindFailures& failures = m_finder->GetFailures();
  std::string text = ShortenedPath(failures.GetFirstFolder()) + ": " + WhyOf(failures);
  if (failures.GetCount() > 1) text += " (and " + std::to_string(failures.GetCount() - 1) + " other folders)";
  return FromUtf8(text);
}
