#include "tools/qxworkbench/script.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <map>

#include "qxcore/core/exception.h"
#include "qxcore/core/raise_error.h"
#include "qxcore/system/file/file.h"
#include "qxcore/ui/app/application.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/text_source.h"
#include "tools/common/utf8.h"
#include "tools/qxworkbench/app.h"
#include "tools/qxworkbench/commands.h"
#include "tools/qxworkbench/picture.h"

InteractiveMode ModeOf(const std::string& name) {
  if (name == "answer") return kInteractiveAnswer;
  if (name == "abort") return kInteractiveAbort;
  if (name.empty() || name == "show") return kInteractiveShow;
  throw Failure{"\"" + name + "\" is no mode: show, answer or abort", kWrongUsage};
}

namespace {

// The published layout of the block that WM_DROPFILES carries; the paths follow.
struct DropBlock {
  DWORD files;
  POINT point;
  BOOL isOutside;
  BOOL isWide;
};
static_assert(sizeof(DropBlock) == 20);

// Words between blanks; quotation marks hold blanks together.
std::vector<std::string> WordsOf(const std::string& line) {
  std::vector<std::string> words;
  bool isOpen = false, isQuoted = false;
  for (const char c : line) {
    if (c == '"') {
      if (!isOpen) words.emplace_back();
      isOpen = true;
      isQuoted = !isQuoted;
    } else if ((c == ' ' || c == '\t' || c == '\r') && !isQuoted) {
      isOpen = false;
    } else {
      if (!isOpen) words.emplace_back();
      isOpen = true;
      words.back() += c;
    }
  }
  return words;
}

constexpr UINT_PTR kPauseTimer = 1;
constexpr UINT kBetweenLooks = 50;  // milliseconds

// Presses a button of the next box that appears, as a person would.
UINT_PTR g_answerTimer = 0;
int g_answer = 0;

void CALLBACK PressButton(HWND, UINT, UINT_PTR, DWORD) {
  const HWND owner = SGetOwnerWnd()->GetSafeHwnd();
  const HWND box = ::GetLastActivePopup(owner);
  if (box == nullptr || box == owner || ::GetDlgItem(box, g_answer) == nullptr) return;
  ::KillTimer(nullptr, g_answerTimer);
  g_answerTimer = 0;
  ::PostMessageW(box, WM_COMMAND, static_cast<WPARAM>(g_answer), reinterpret_cast<LPARAM>(::GetDlgItem(box, g_answer)));
}

// --- the commands ---

struct Call {
  const std::vector<std::string>& words;
  WorkbenchFrame& frame;
  WorkbenchApp& app;

  const std::string& Word(std::size_t at) const {
    if (at >= words.size()) throw Failure{"a word is missing behind " + words.back()};
    return words[at];
  }
  int Document(std::size_t at) const {
    const int number = frame.Documents().Find(FromUtf8(Word(at)));
    if (number < 0) throw Failure{"there is no such file in the list", kFailed, Word(at)};
    return number;
  }
  int Number(std::size_t at) const { return std::atoi(Word(at).c_str()); }
};

void Open(const Call& call) { call.frame.OpenFolder(console::NameOf(call.Word(1))); }

// A drop as the system sends it: the paths, each with its end, and one more end.
void Drop(const Call& call) {
  std::vector<WCHAR> paths;
  for (std::size_t at = 1; at == 1 || at < call.words.size(); ++at) {
    const SString path = console::NameOf(call.Word(at));
    paths.insert(paths.end(), path.View().begin(), path.View().end());
    paths.push_back(0);
  }
  const std::size_t size = sizeof(DropBlock) + (paths.size() + 1) * sizeof(WCHAR);
  const HGLOBAL block = ::GlobalAlloc(GMEM_MOVEABLE | GMEM_ZEROINIT, size);
  auto* drop = static_cast<DropBlock*>(::GlobalLock(block));
  drop->files = sizeof(DropBlock);
  drop->isWide = 1;
  std::copy(paths.begin(), paths.end(), reinterpret_cast<WCHAR*>(drop + 1));
  ::GlobalUnlock(block);
  call.frame.SendMessageW(WM_DROPFILES, reinterpret_cast<WPARAM>(block));
}

void Sort(const Call& call) {
  static const std::map<std::string, Column> columns = {
      {"name", Column::kName}, {"encoding", Column::kEncoding}, {"size", Column::kSize}, {"warning", Column::kWarning}};
  const auto column = columns.find(call.Word(1));
  if (column == columns.end()) throw Failure{"there is no such column", kFailed, call.Word(1)};
  call.frame.SendMessageW(WM_COMMAND, kSortFirst + static_cast<UINT>(column->second));
  const bool isDown = call.words.size() > 2 && call.Word(2) == "down";
  if (isDown != call.frame.Documents().IsDescending()) call.frame.List().SortBy(column->second);
}

void Select(const Call& call) {
  if (call.Word(1) == "all") {
    call.frame.SendMessageW(WM_COMMAND, kSelectAll);
  } else if (call.Word(1) == "none") {
    call.frame.Documents().SelectAll(false);
  } else {
    for (std::size_t at = 1; at < call.words.size(); ++at) call.frame.Documents().Select(call.Document(at), true);
  }
  call.frame.List().ListChanged();
  call.frame.SendMessageW(WM_COMMAND, kSelectionChanged);
}

void Preview(const Call& call) {
  call.frame.List().Focus(call.Document(1));
  PreviewView* preview = call.frame.ShowPreview(call.Document(1));
  if (preview != nullptr && call.words.size() > 3 && call.Word(2) == "as")
    preview->Show(EncodingOf(call.Word(3), "as"));
}

void Convert(const Call& call) {
  SString folder;
  if (call.words.size() > 3 && call.Word(2) == "to") folder = console::NameOf(call.Word(3));
  call.frame.ConvertSelected(EncodingOf(call.Word(1), "convert"), folder);
}

void Answer(const Call& call) {
  static const std::map<std::string, int> buttons = {{"yes", IDYES}, {"no", IDNO}, {"ok", IDOK}, {"cancel", IDCANCEL}};
  const auto button = buttons.find(call.Word(1));
  if (button == buttons.end()) throw Failure{"there is no such answer", kFailed, call.Word(1)};
  g_answer = button->second;
  if (g_answerTimer == 0) g_answerTimer = ::SetTimer(nullptr, 0, 20, &PressButton);
}

void Cancel(const Call& call) {
  if (call.words.size() > 2 && call.Word(1) == "after") return call.frame.CancelAfter(call.Number(2));
  if (!call.frame.CancelWork()) throw Failure{"there is nothing to cancel"};
}

// A name, or a text with one, without what would begin another line or column.
std::string OnOneLine(const SString& shown) {
  std::string text = ToUtf8(shown);
  std::replace_if(
      text.begin(), text.end(), [](char c) { return c >= 0 && c < ' '; }, '?');
  return text;
}

std::string ListText(const DocumentList& documents) {
  std::string text;
  for (int row = 0; row < documents.Count(); ++row) {
    const Document& document = documents.AtRow(row);
    text += OnOneLine(document.name) + "\t" + ToUtf8(document.encodingName) + "\t" + std::to_string(document.bytes) +
            "\t" + ToUtf8(document.warning) + "\n";
  }
  return text;
}

std::string PreviewLines(const WorkbenchFrame& frame) {
  const PreviewView* preview = frame.CurrentPreview();
  if (preview == nullptr) throw Failure{"there is no preview"};
  std::string text;
  for (int line = 0; line < preview->Text().LineCount(); ++line) text += ToUtf8(preview->Text().Line(line)) + "\n";
  return text;
}

void PrintIt(const Call& call) {
  const std::string& what = call.Word(1);
  if (what == "list") {
    Print(ListText(call.frame.Documents()));
  } else if (what == "status") {
    Print(OnOneLine(call.frame.StatusText()) + "\n");
  } else if (what == "preview") {
    Print(PreviewLines(call.frame));
  } else if (what == "splitter") {
    Print(ToUtf8(call.frame.Splitter().GetState()) + "\n");
  } else if (what == "timing") {
    char line[96];
    std::snprintf(line, sizeof line, "longest step: %.1f ms (%s)\n", call.app.LongestStep(),
                  call.app.LongestStepName().c_str());
    Print(line);
  } else {
    throw Failure{"cannot be printed", kFailed, what};
  }
  FlushPrinted();
}

void Dark(const Call& call) {
  call.app.UseDarkColors();
  call.frame.SendMessageW(WM_SYSCOLORCHANGE);
  ::RedrawWindow(call.frame.m_hWnd, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_ALLCHILDREN);
}

void Resize(const Call& call) {
  call.frame.SetWindowPos(nullptr, 0, 0, call.Number(1), call.Number(2), SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
}

void Split(const Call& call) {
  call.frame.Splitter().SetColumnInfo(0, call.Number(1), -1);
  call.frame.Splitter().RecalcLayout();
}

// A key, sent to where the keyboard is, as the loop takes it from the queue.
void Key(const Call& call) {
  static const std::map<std::string, WPARAM> keys = {
      {"up", VK_UP},         {"down", VK_DOWN},    {"home", VK_HOME},   {"end", VK_END},   {"pageup", VK_PRIOR},
      {"pagedown", VK_NEXT}, {"enter", VK_RETURN}, {"space", VK_SPACE}, {"f5", VK_F5},     {"f6", VK_F6},
      {"escape", VK_ESCAPE}, {"tab", VK_TAB},      {"f8", VK_F8},       {"left", VK_LEFT}, {"right", VK_RIGHT}};
  const auto key = keys.find(call.Word(1));
  if (key == keys.end()) throw Failure{"there is no such key", kFailed, call.Word(1)};
  ::PostMessageW(::GetFocus(), WM_KEYDOWN, key->second, 1);
}

void Next(const Call& call) { call.frame.SendMessageW(WM_COMMAND, call.Word(1) == "next" ? kNextPart : kPreviousPart); }
void CloseTab(const Call& call) { call.frame.SendMessageW(WM_COMMAND, kClosePreview); }
void Picture(const Call& call) { SavePicture(call.frame, console::NameOf(call.Word(1))); }
void Echo(const Call& call) {
  Print(call.Word(1) + "\n");
  FlushPrinted();
}

const std::map<std::string, void (*)(const Call&)>& Commands() {
  static const std::map<std::string, void (*)(const Call&)> commands = {{"open", &Open},
                                                                        {"drop", &Drop},
                                                                        {"sort", &Sort},
                                                                        {"select", &Select},
                                                                        {"preview", &Preview},
                                                                        {"convert", &Convert},
                                                                        {"answer", &Answer},
                                                                        {"cancel", &Cancel},
                                                                        {"print", &PrintIt},
                                                                        {"dark", &Dark},
                                                                        {"size", &Resize},
                                                                        {"split", &Split},
                                                                        {"key", &Key},
                                                                        {"part", &Next},
                                                                        {"close", &CloseTab},
                                                                        {"picture", &Picture},
                                                                        {"echo", &Echo},
                                                                        {"wait", [](const Call&) {}},
                                                                        {"pause", [](const Call&) {}}};
  return commands;
}

}  // namespace

// --- the file ---

Script::Script(const std::string& file) : m_file(file) {
  SString text;
  try {
    TextSource source(file, Encodings::kUTF8 | Encodings::kOptionalBOM | Encodings::kFullUnicode);
    source.Select();
    text = source.Reader().ReadAll();
    source.CheckRead();
  } catch (...) {
    throw Failure{ReasonOfCurrentException(), kFailed, file};
  }
  const std::string utf8 = ToUtf8(text);
  int number = 0;
  for (std::size_t begin = 0; begin < utf8.size();) {
    std::size_t end = std::min(utf8.find('\n', begin), utf8.size());
    std::string line = utf8.substr(begin, end - begin);
    begin = end + 1;
    ++number;
    line.erase(0, line.find_first_not_of(" \t\r"));
    const bool mayFail = !line.empty() && line[0] == '-';
    if (mayFail) line.erase(0, 1);
    if (line.empty() || line[0] == '#') continue;
    m_lines.push_back({number, mayFail, WordsOf(line)});
    const std::string& name = m_lines.back().words.front();
    if (Commands().count(name) == 0)
      throw Failure{"line " + std::to_string(number) + ": there is no command \"" + name + "\"", kWrongUsage, file};
  }
  // What is aborted comes here, and needs no second message.
  g_SetErrorReporter(nullptr);
}

// A command begins when the work of those before has ended; only cancelling and answering go in between.
bool Script::Step(WorkbenchFrame& frame, WorkbenchApp& app) {
  m_waits = false;
  if (m_next > 0 && !frame.IsBusy()) Settle(m_lines[m_next - 1]);
  if (m_next == m_lines.size()) return m_waits = frame.IsBusy(), false;
  const Line& line = m_lines[m_next];
  const bool interrupts = line.words[0] == "cancel" || line.words[0] == "answer";
  if (frame.IsBusy() && !interrupts) {
    m_waits = true;
    return false;
  }
  if (line.words[0] == "pause" && !HasComeUp(line, frame)) return false;
  ++m_next;
  Run(line, frame, app);
  return true;
}

// Looks for the file that a pause waits for, now and then.
bool Script::HasComeUp(const Line& line, WorkbenchFrame& frame) {
  const bool exists = line.words.size() < 2 || SFile::Exists(console::NameOf(line.words[1]));
  m_waits = !exists;
  if (exists) {
    frame.KillTimer(kPauseTimer);
  } else {
    frame.SetTimer(kPauseTimer, kBetweenLooks);
  }
  return exists;
}

// What the last command, and the work that it began, failed with.
void Script::Settle(const Line& line) {
  if (m_failure.IsEmpty()) return;
  const std::string text = m_file + ":" + std::to_string(line.number) + ": " + ToUtf8(m_failure);
  m_failure = SString();
  if (!line.mayFail) throw ScriptFailure{text};
  Complain(text);
}

void Script::Run(const Line& line, WorkbenchFrame& frame, WorkbenchApp& app) {
  try {
    Commands().at(line.words[0])(Call{line.words, frame, app});
  } catch (const Failure& failure) {
    m_failure = FromUtf8(failure.place.empty() ? failure.text : failure.place + ": " + failure.text);
  } catch (const STargetedException& abort) {
    m_failure = abort.GetMessageText();
  } catch (const SException& exception) {
    m_failure = exception.GetText();
  }
}
