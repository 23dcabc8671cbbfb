// Lists the files of a folder and finds out their encodings, a step at a time.
//
// A step handles small files itself. A large one is looked at by a thread, which reads it in pieces, so that no step
// takes long; when it is done, the job calls `wake` on that thread, and the next step takes the finding.
#pragma once

#include <atomic>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <thread>

#include "qxcore/system/file/recurse_find.h"
#include "tools/qxworkbench/document_list.h"
#include "tools/qxworkbench/time_slice.h"

class DetectionJob {
 public:
  // `wake` is called on another thread and must only cause a further step.
  DetectionJob(DocumentList& documents, std::function<void()> wake);
  DetectionJob(const DetectionJob&) = delete;
  DetectionJob& operator=(const DetectionJob&) = delete;
  ~DetectionJob();

  // Empties the list and begins with the files of a folder and of all folders below it. Throws Failure when it is no
  // folder or cannot be read; the list is as it was then.
  void Open(const SString& folder);
  // Works on for a while.
  void Step(const TimeSlice& slice = TimeSlice());
  // Ends the work; what was found stays.
  void Cancel();

  bool IsRunning() const { return m_isListing || !m_waiting.empty() || !m_waitingLarge.empty() || m_large != nullptr; }
  // Whether a step has something to do at once, rather than wait for the thread.
  bool HasWork() const { return m_isListing || !m_waiting.empty() || (m_large == nullptr && !m_waitingLarge.empty()); }
  bool WasCancelled() const { return m_wasCancelled; }
  const SString& Folder() const { return m_folder; }
  int Done() const { return m_done; }  // files that were looked at
  // Folders that could not be read, in words; empty when there were none.
  SString Failures() const;
  // The document that changed last; -1 for none.
  int LastChanged() const { return m_lastChanged; }

 private:
  class Large;

  void ListSome(const TimeSlice& slice);
  void AddFound();
  void LookAtNext();
  void TakeLarge();
  void Enter(int number, const Finding& finding);

  DocumentList& m_documents;
  std::function<void()> m_wake;
  SString m_folder;
  SString m_prefix;  // of all paths, the backslash included
  std::unique_ptr<SRecurseFindFiles> m_finder;
  bool m_isListing = false;
  bool m_wasCancelled = false;
  std::deque<int> m_waiting;       // small documents, by number
  std::deque<int> m_waitingLarge;  // large ones
  std::unique_ptr<Large> m_large;  // the one that is being looked at
  int m_done = 0;
  int m_lastChanged = -1;
};
