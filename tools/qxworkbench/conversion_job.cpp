#include "tools/qxworkbench/conversion_job.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

// The stream goes before the file that it writes to, and the source before the file is replaced: on some systems an
// open file cannot be.
struct ConversionJob::Current {
  Current(const ConversionItem& item, Encoding to, bool isTrial) {
    source = std::make_unique<TextSource>(item.native, item.from | Encodings::kFullUnicode);
    source->Select();
    if (!isTrial) {
      std::filesystem::create_directories(console::PathOf(item.target).parent_path());
      file.emplace(item.target);
      output = std::make_unique<FileOutput>(file->File());
    } else {
      output = std::make_unique<Nowhere>();
    }
    pass.emplace(item.native, *source, *output, to | Encodings::kFullUnicode, std::nullopt);
  }
  TextOutcome Finish() {
    const TextOutcome outcome = pass->Finish();
    output->Flush();
    pass.reset();
    source.reset();
    if (file) file->Commit(true);
    return outcome;
  }

  std::unique_ptr<TextSource> source;
  std::optional<ReplacementFile> file;
  std::unique_ptr<SOutputStream> output;
  std::optional<TextPass> pass;
};

ConversionJob::ConversionJob() = default;
ConversionJob::~ConversionJob() = default;

void ConversionJob::Start(std::vector<ConversionItem> items, Encoding to) {
  Cancel();
  m_items = std::move(items);
  m_to = to;
  m_next = 0;
  m_wasCancelled = m_isTrialOver = false;
  m_phase = kTrying;
}

void ConversionJob::Write() {
  m_next = 0;
  m_isTrialOver = true;
  m_phase = kWriting;
}

void ConversionJob::Cancel() {
  m_current.reset();
  if (IsRunning() || m_phase == kAsking) {
    m_wasCancelled = true;
    m_phase = kEnded;
  }
}

bool ConversionJob::Step(const TimeSlice& slice) {
  do {
    if (m_next == m_items.size()) {
      m_phase = m_phase == kTrying ? kAsking : kEnded;
    } else {
      Advance(m_items[m_next]);
    }
  } while (IsRunning() && !slice.IsOver());
  return IsRunning();
}

// Opens the item, passes one piece on, or finishes it.
void ConversionJob::Advance(ConversionItem& item) {
  if (!item.error.empty()) return NextItem();  // the trial could not read it
  try {
    if (m_current == nullptr) {
      m_current = std::make_unique<Current>(item, m_to, m_phase == kTrying);
    } else if (!m_current->pass->CopyPiece()) {
      FinishItem(item);
    }
  } catch (const Failure& failure) {
    item.error = failure.text;
    NextItem();
  } catch (...) {
    item.error = ReasonOfCurrentException();
    NextItem();
  }
}

void ConversionJob::FinishItem(ConversionItem& item) {
  const TextOutcome outcome = m_current->Finish();
  if (m_phase == kTrying) {
    item.losses = outcome.reading;
    if (!item.losses.IsEmpty() && !outcome.writing.IsEmpty()) item.losses += WTEXT(" ");
    item.losses += outcome.writing;
  } else {
    item.isWritten = true;
  }
  NextItem();
}

void ConversionJob::NextItem() {
  m_current.reset();
  ++m_next;
}

int ConversionJob::CountLossy() const {
  return static_cast<int>(
      std::count_if(m_items.begin(), m_items.end(), [](const ConversionItem& item) { return !item.losses.IsEmpty(); }));
}
int ConversionJob::CountFailed() const {
  return static_cast<int>(
      std::count_if(m_items.begin(), m_items.end(), [](const ConversionItem& item) { return !item.error.empty(); }));
}
int ConversionJob::CountWritten() const {
  return static_cast<int>(
      std::count_if(m_items.begin(), m_items.end(), [](const ConversionItem& item) { return item.isWritten; }));
}

// --- in words ---

namespace {

std::string Files(int count) { return std::to_string(count) + (count == 1 ? " file" : " files"); }

constexpr int kMostLines = 12;  // of a question, so that it fits a screen

// "\n  NAME: TEXT" for each item that has one, as far as there is room. The text is often the same for all.
template <class TextOf>
std::string Lines(const std::vector<ConversionItem>& items, int count, TextOf textOf) {
  std::string lines;
  std::string former;
  int shown = 0;
  for (const ConversionItem& item : items) {
    const std::string text = textOf(item);
    if (text.empty() || shown == kMostLines) continue;
    lines += "\n  " + ToUtf8(item.name) + ": " + (text == former ? "the same" : text);
    former = text;
    ++shown;
  }
  if (count > shown) lines += "\n  and " + Files(count - shown) + " more";
  return lines;
}

}  // namespace

SString SummaryOf(const ConversionJob& job) {
  const int lossy = job.CountLossy(), failed = job.CountFailed(), ready = job.Total() - failed;
  std::string text = "Convert " + Files(ready) + " to " + ToUtf8(ShownName(job.Target())) + "?";
  if (lossy == 0) {
    text += "\nNothing would be lost.";
  } else {
    text += "\n" + Files(lossy) + " would lose characters:";
    text += Lines(job.Items(), lossy, [](const ConversionItem& item) { return ToUtf8(item.losses); });
  }
  if (failed != 0) {
    text += "\n" + Files(failed) + " cannot be converted:";
    text += Lines(job.Items(), failed, [](const ConversionItem& item) { return item.error; });
  }
  return FromUtf8(text);
}

SString ResultOf(const ConversionJob& job) {
  const int written = job.CountWritten(), failed = job.CountFailed();
  std::string text = job.WasCancelled() ? "Cancelled: " : "";
  text += Files(written) + (written == 1 ? " was" : " were") + " converted";
  if (job.WasCancelled() && written + failed < job.Total()) {
    text += ", " + Files(job.Total() - written - failed) + " left as before";
  }
  for (const ConversionItem& item : job.Items()) {
    if (item.error.empty()) continue;
    text += "; " + ToUtf8(item.name) + ": " + item.error;
    if (failed > 1) text += " (and " + Files(failed - 1) + " more could not be converted)";
    break;
  }
  return FromUtf8(text);
}
