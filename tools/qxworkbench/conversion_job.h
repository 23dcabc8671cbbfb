// Converts documents to an encoding: first a trial that writes nothing and says what would be lost, then, when
// somebody has agreed to that, the conversion. Both go a piece at a time.
//
// A file is replaced only when all of its new content has been written (replacement_file.h), so that whatever goes
// wrong and whenever the work is cancelled, each file is either the old one or the new one.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "tools/common/replacement_file.h"
#include "tools/common/text_pass.h"
#include "tools/qxworkbench/time_slice.h"

// One document on its way.
struct ConversionItem {
  std::string native;  // the file, as an argument
  SString name;        // as the list shows it
  int number = -1;     // in the list
  Encoding from = 0;   // what it is read in
  std::string target;  // where it goes, a path of the system
  SString losses;      // what the trial found would be lost; empty for nothing
  std::string error;   // why it could not be converted; empty when it could
  bool isWritten = false;
};

class ConversionJob {
 public:
  enum Phase { kIdle, kTrying, kAsking, kWriting, kEnded };

  // Begins the trial. A running job is cancelled before.
  void Start(std::vector<ConversionItem> items, Encoding to);
  // Works on for a while. True while another step has something to do at once; false in kAsking, too.
  bool Step(const TimeSlice& slice = TimeSlice());
  // In kAsking: goes on with the conversion of what the trial could read.
  void Write();
  // Ends the work; a file that is not complete stays as it was.
  void Cancel();

  Phase GetPhase() const { return m_phase; }
  bool IsRunning() const { return m_phase == kTrying || m_phase == kWriting; }
  bool WasCancelled() const { return m_wasCancelled; }
  const std::vector<ConversionItem>& Items() const { return m_items; }
  Encoding Target() const { return m_to; }
  int Total() const { return static_cast<int>(m_items.size()); }
  // How many of the conversion itself are done.
  int DoneWriting() const { return m_isTrialOver ? static_cast<int>(m_next) : 0; }
  // How many files are done, each counted once in the trial and once in the conversion.
  int Done() const { return static_cast<int>(m_next) + (m_isTrialOver ? Total() : 0); }

  // How many items have losses, an error, or were written.
  int CountLossy() const;
  int CountFailed() const;
  int CountWritten() const;

 private:
  // The item that is being worked on.
  struct Current;

  void Advance(ConversionItem& item);
  void FinishItem(ConversionItem& item);
  void NextItem();

  std::vector<ConversionItem> m_items;
  Encoding m_to = 0;
  Phase m_phase = kIdle;
  bool m_wasCancelled = false;
  bool m_isTrialOver = false;
  std::size_t m_next = 0;
  std::unique_ptr<Current> m_current;

 public:
  ConversionJob();
  ~ConversionJob();
};

// What is asked before anything is written: how many files go where, and what would be lost, file by file.
SString SummaryOf(const ConversionJob& job);
// What came of it, in one line.
SString ResultOf(const ConversionJob& job);
