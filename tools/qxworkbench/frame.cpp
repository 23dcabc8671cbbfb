#include "tools/qxworkbench/frame.h"

#include "qxcore/core/throw_target.h"
#include "qxcore/system/file/file.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/message_box.h"
#include "qxcore/ui/window/message_entries.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"
#include "tools/qxworkbench/commands.h"
#include "tools/qxworkbench/settings.h"
#include "tools/qxworkbench/text_dialog.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(
    WorkbenchFrame, SDockSiteFrameWnd, on<WM_DESTROY, &WorkbenchFrame::OnDestroy>(),
    on<WM_DROPFILES, &WorkbenchFrame::OnDropFiles>(), on<kMsgWorkIsDone, &WorkbenchFrame::OnWorkIsDone>(),
    on<kMsgInterrupted, &WorkbenchFrame::OnInterrupted>(), command<kOpenFolder, &WorkbenchFrame::OnOpenFolder>(),
    command<kRefresh, &WorkbenchFrame::OnRefresh>(), update<kRefresh, &WorkbenchFrame::OnUpdateNeedsFolder>(),
    command<kConvert, &WorkbenchFrame::OnConvert>(), update<kConvert, &WorkbenchFrame::OnUpdateNeedsSelection>(),
    command<kPreview, &WorkbenchFrame::OnPreview>(), update<kPreview, &WorkbenchFrame::OnUpdateNeedsSelection>(),
    command<kClosePreview, &WorkbenchFrame::OnClosePreview>(),
    update<kClosePreview, &WorkbenchFrame::OnUpdateNeedsPreview>(), command<kSelectAll, &WorkbenchFrame::OnSelectAll>(),
    update<kSelectAll, &WorkbenchFrame::OnUpdateNeedsFolder>(), command<kCancelWork, &WorkbenchFrame::OnCancelWork>(),
    update<kCancelWork, &WorkbenchFrame::OnUpdateCancel>(),
    command_range<kNextPart, kPreviousPart, &WorkbenchFrame::OnPart>(),
    update_range<kNextPart, kPreviousPart, &WorkbenchFrame::OnUpdateNeedsPreview>(),
    command<kExit, &WorkbenchFrame::OnExit>(), command<kAbout, &WorkbenchFrame::OnAbout>(),
    command<kSelectionChanged, &WorkbenchFrame::OnSelectionChanged>(),
    command_range<kSortFirst, kSortLast, &WorkbenchFrame::OnSort>(),
    update_range<kSortFirst, kSortLast, &WorkbenchFrame::OnUpdateSort>(),
    command_range<kViewDetected, kViewOther, &WorkbenchFrame::OnViewAs>(),
    update_range<kViewDetected, kViewOther, &WorkbenchFrame::OnUpdateViewAs>())

namespace {

constexpr int kFilesPane = 1, kSelectedPane = 2;
constexpr DWORD kPatience = 200;       // milliseconds of work before the progress is shown
constexpr DWORD kBetweenPaints = 100;  // of a list that is being filled, milliseconds
constexpr LPCWSTR kSplitterSetting = WTEXT("Splitter");
constexpr LPCWSTR kFolderSetting = WTEXT("Folder");

SString FilesText(int count) { return FromUtf8(std::to_string(count) + (count == 1 ? " file" : " files")); }

// The folder in which the paths of all documents begin, as a path of the system.
std::string TargetOf(const Document& document, const SString& folder) {
  if (folder.IsEmpty()) return document.native;
  return SFile::ToNative(SFile::NormalizeDirectoryName(folder) + WTEXT("\\") + document.below);
}

}  // namespace

WorkbenchFrame::WorkbenchFrame() : m_detection(m_documents, [this] { ::PostMessageW(m_hWnd, kMsgWorkIsDone, 0, 0); }) {}

// --- the window ---

int WorkbenchFrame::OnCreateClient(CREATESTRUCTW*, SCreateContext*) {
  MakeMenu();
  MakeBar();
  if (!m_splitter.CreateStatic(this, 1, 2, WS_CHILD | WS_VISIBLE, kSFirstPane)) return 0;
  const int width = GetClientRect().Width();
  m_list = new FileListView(m_documents);
  if (!m_list->Create(nullptr, nullptr, WS_CHILD | WS_VISIBLE, SRect(), &m_splitter, SSplitterWnd::IdFromRowCol(0, 0)))
    return 0;
  if (m_tabs.Create(&m_splitter, nullptr, nullptr, WS_CHILD | WS_VISIBLE, SSplitterWnd::IdFromRowCol(0, 1)) == 0)
    return 0;
  m_tabs.GetTabBeam()->SetScrollButtons(1, 0);
  m_tabs.ShowScrollBar(SB_BOTH, 0);  // until there is something to scroll
  m_tabs.SetNoTabText(WTEXT("Enter, or a double click on a file, shows its text here."));
  m_splitter.AddPane(0, 0, m_list, SSize(width / 2, 0));
  m_splitter.AddPane(0, 1, &m_tabs, SSize(0, 0));
  m_splitter.SetColumnInfo(0, width / 2, 60);
  RestoreSplitter();
  SetActiveView(m_list);
  DragAcceptFiles();
  ShowCounts();
  return 1;
}

void WorkbenchFrame::RestoreSplitter() {
  const SString state = ReadSetting(kSplitterSetting);
  if (!state.IsEmpty()) m_splitter.SetState(state);
}

void WorkbenchFrame::MakeBar() {
  m_bar.Create(this);
  m_bar.InsertPane(0, 0, kSPaneMain | kSPaneStretch);
  m_bar.InsertPane(kFilesPane, 0, kSPaneAutoSize);
  m_bar.InsertPane(kSelectedPane, 0, kSPaneAutoSize);
  Say(WTEXT("Open a folder to begin, or drop one here."));
}

// Without work to cancel, Escape belongs to what has the keyboard.
int WorkbenchFrame::PreTranslateMessage(MSG* message) {
  const bool isEscape = message->message == WM_KEYDOWN && message->wParam == VK_ESCAPE;
  if (isEscape && !m_bar.InProgress()) return SWnd::PreTranslateMessage(message);
  return SDockSiteFrameWnd::PreTranslateMessage(message);
}

void WorkbenchFrame::OnDestroy() {
  m_detection.Cancel();
  m_conversion.Cancel();
  KeepSetting(kSplitterSetting, m_splitter.GetState());
  SDockSiteFrameWnd::OnDestroy();
}

// --- messages to the user ---

void WorkbenchFrame::Say(const SString& text) { m_bar.SetMainPaneText(&text); }

void WorkbenchFrame::ShowCounts() {
  const SString files = FilesText(m_documents.Count());
  const SString selected = SString(static_cast<long>(m_documents.SelectedCount())) + WTEXT(" selected");
  m_bar.SetPaneText(kFilesPane, &files);
  m_bar.SetPaneText(kSelectedPane, &selected);
}

void WorkbenchFrame::Report(const SString& text) {
  Say(text);
  if (m_reporter) {
    m_reporter(text);
  } else {
    MessageBoxW(text, WTEXT("qxcore workbench"), MB_OK | MB_ICONWARNING);
  }
}

template <class Work>
void WorkbenchFrame::Try(const Work& work) {
  try {
    work();
  } catch (const Failure& failure) {
    Report(FromUtf8(failure.place.empty() ? failure.text : failure.place + ": " + failure.text));
  }
}

// --- work in steps ---

bool WorkbenchFrame::IsBusy() const {
  if (m_detection.IsRunning() || m_conversion.IsRunning() || m_conversion.GetPhase() == ConversionJob::kAsking)
    return true;
  for (int tab = 0; tab < m_tabs.GetTabCount(); ++tab)
    if (!static_cast<PreviewView*>(m_tabs.GetTabWindow(tab))->Text().IsComplete()) return true;
  return false;
}

bool WorkbenchFrame::Step() {
  if (m_isAsking) return false;
  if (m_detection.IsRunning() || m_wasDetecting) StepDetection();
  try {
    if (m_conversion.IsRunning() || m_conversion.GetPhase() == ConversionJob::kAsking) StepConversion();
  } catch (const STargetedException& abort) {
    Report(abort.GetMessageText());  // nobody is there to answer, and the mode forbids to guess
  }
  return StepPreviews() || m_conversion.IsRunning() || m_detection.HasWork();
}

// The one that is shown first.
bool WorkbenchFrame::StepPreviews() {
  if (PreviewView* preview = CurrentPreview(); preview != nullptr && preview->Step()) return true;
  for (int tab = 0; tab < m_tabs.GetTabCount(); ++tab)
    if (static_cast<PreviewView*>(m_tabs.GetTabWindow(tab))->Step()) return true;
  return false;
}

void WorkbenchFrame::StepDetection() {
  m_wasDetecting = true;
  m_detection.Step(Slice());
  ShowList();
  ShowProgress(m_detection.Done(), m_documents.Count());
  if (CancelWasPressed(m_detection.Done())) m_detection.Cancel();
  if (m_detection.IsRunning()) return;
  m_wasDetecting = false;
  m_list->ListChanged();
  EndProgress();
  ShowCounts();
  const SString looked = FilesText(m_detection.Done());
  if (m_detection.WasCancelled()) {
    Say(WTEXT("Cancelled after ") + looked);
  } else if (const SString failures = m_detection.Failures(); !failures.IsEmpty()) {
    Report(failures);
  } else {
    const int failed = m_documents.FailedCount();
    Say(looked + WTEXT(" in ") + ShownPath(m_detection.Folder()) +
        (failed == 0 ? SString() : WTEXT("; ") + FilesText(failed) + WTEXT(" could not be read")));
  }
}

void WorkbenchFrame::StepConversion() {
  if (m_conversion.IsRunning()) m_conversion.Step(Slice());
  EnterConverted();
  ShowProgress(m_conversion.Done(), 2 * m_conversion.Total());
  if (CancelWasPressed(m_conversion.Done())) m_conversion.Cancel();
  if (m_conversion.IsRunning()) return;
  if (m_conversion.GetPhase() == ConversionJob::kAsking) return AskAndWrite();
  EndProgress();
  const SString result = ResultOf(m_conversion);
  if (m_conversion.CountFailed() > 0) {
    Report(result);
  } else {
    Say(result);
  }
}

// What was converted in its place is from now on read in its new encoding. Another folder may be open by then.
void WorkbenchFrame::EnterConverted() {
  for (; m_entered < m_conversion.DoneWriting(); ++m_entered) {
    const ConversionItem& item = m_conversion.Items()[static_cast<std::size_t>(m_entered)];
    if (!item.isWritten || item.target != item.native) continue;
    if (item.number < m_documents.Count() && m_documents.At(item.number).native == item.native)
      m_documents.SetConverted(item.number, m_conversion.Target());
    if (PreviewView* preview = FindPreview(item.native)) preview->SetDetected(m_conversion.Target());
  }
  if (m_conversion.GetPhase() == ConversionJob::kEnded) {
    m_list->ListChanged();
  } else {
    ShowList();
  }
}

// Where something would be lost, the default is not to write.
void WorkbenchFrame::AskAndWrite() {
  struct Asking {
    explicit Asking(WorkbenchFrame& owner) : frame(owner) { frame.m_isAsking = true; }
    ~Asking() {
      frame.m_isAsking = false;
      if (frame.m_conversion.GetPhase() == ConversionJob::kAsking) frame.m_conversion.Cancel();
    }
    WorkbenchFrame& frame;
  } asking(*this);
  const bool isLossy = m_conversion.CountLossy() > 0;
  m_bar.EndProgress();  // the question comes first
  if (m_conversion.CountFailed() == m_conversion.Total()) {
    m_conversion.Cancel();
    EndProgress();
    return Report(ResultOf(m_conversion));
  }
  const UINT style = MB_YESNO | (isLossy ? MB_ICONWARNING | MB_DEFBUTTON2 : MB_ICONQUESTION);
  if (MessageBoxW(SummaryOf(m_conversion), WTEXT("Convert"), style) == IDYES) {
    m_workBegan = ::GetTickCount();
    m_conversion.Write();
  } else {
    m_conversion.Cancel();
    EndProgress();
    Say(WTEXT("Nothing was converted."));
  }
}

// Painting the list for each step would take longer than the steps.
void WorkbenchFrame::ShowList() {
  const DWORD now = ::GetTickCount();
  if (now - m_listShown < kBetweenPaints) return;
  m_listShown = now;
  m_list->ListChanged();
}

// Who waits for a number of files gets them one by one.
TimeSlice WorkbenchFrame::Slice() const {
  return m_cancelAfter < 0 ? TimeSlice() : TimeSlice(std::chrono::milliseconds(0));
}

// Short work shows no progress, which would only flash.
void WorkbenchFrame::ShowProgress(int done, int total) {
  if (!m_bar.InProgress()) {
    if (::GetTickCount() - m_workBegan < kPatience && m_cancelAfter < 0) return;
    m_bar.StartProgress(1);
  }
  m_bar.GetProgressCtrl().SetRange(0, total);
  m_bar.GetProgressCtrl().SetPos(done);
}

void WorkbenchFrame::EndProgress() {
  m_bar.EndProgress();
  m_cancelAfter = -1;
}

bool WorkbenchFrame::CancelWork() {
  if (!m_bar.InProgress()) return false;
  if (SWnd* button = m_bar.GetDlgItem(IDCANCEL)) button->SendMessageW(BM_CLICK);
  return true;
}

bool WorkbenchFrame::CancelWasPressed(int done) {
  if (m_cancelAfter >= 0 && done >= m_cancelAfter) CancelWork();
  SProgressStatusBar::Status status;
  m_bar.GetSetProgressStatus(&status, nullptr);
  return (status.m_flags & SProgressStatusBar::kCancelRequested) != 0;
}

// Idle work goes on.
LRESULT WorkbenchFrame::OnWorkIsDone(WPARAM, LPARAM) {
  if (SWinApp* app = SGetApp()) app->SetNeedOnIdle(1);
  return 0;
}

// A box that asks something is answered as far as it must be; the application's idle work then ends the program.
LRESULT WorkbenchFrame::OnInterrupted(WPARAM, LPARAM) {
  const HWND box = ::GetLastActivePopup(m_hWnd);
  for (const int button : {IDCANCEL, IDNO, IDOK}) {
    const HWND control = box != m_hWnd ? ::GetDlgItem(box, button) : nullptr;
    if (control == nullptr) continue;
    ::PostMessageW(box, WM_COMMAND, static_cast<WPARAM>(button), reinterpret_cast<LPARAM>(control));
    break;
  }
  return OnWorkIsDone(0, 0);
}

// --- folders and previews ---

void WorkbenchFrame::OpenFolder(const SString& folder) {
  m_detection.Open(folder);
  m_workBegan = ::GetTickCount();
  m_wasDetecting = true;
  KeepSetting(kFolderSetting, m_detection.Folder());
  SetWindowTextW(ShownPath(m_detection.Folder()) + WTEXT(" \u2013 qxcore workbench"));
  Say(WTEXT("Reading ") + ShownPath(m_detection.Folder()));
  m_list->ListChanged();
  ShowCounts();
}

PreviewView* WorkbenchFrame::CurrentPreview() const { return static_cast<PreviewView*>(m_tabs.GetActiveTab()); }

PreviewView* WorkbenchFrame::FindPreview(const std::string& native) const {
  for (int tab = 0; tab < m_tabs.GetTabCount(); ++tab) {
    auto* preview = static_cast<PreviewView*>(m_tabs.GetTabWindow(tab));
    if (preview->File() == native) return preview;
  }
  return nullptr;
}

PreviewView* WorkbenchFrame::ShowPreview(int number) {
  const Document& document = m_documents.At(number);
  if (PreviewView* shown = FindPreview(document.native)) {
    m_tabs.ActivateTab(m_tabs.GetTabIndex(shown));
    return shown;
  }
  const Encoding encoding = document.encoding != 0 ? document.encoding : Encodings::kANSI;
  auto* preview = new PreviewView(document.name, document.native, encoding);  // ends with its window
  if (!preview->Create(nullptr, nullptr, WS_CHILD, SRect(), &m_tabs, m_tabs.GetNextID())) return nullptr;
  const auto behind = static_cast<int>(document.name.View().find_last_of(WTEXT("\\/")) + 1);
  m_tabs.ShowScrollBar(SB_BOTH, 1);
  m_tabs.ActivateTab(m_tabs.AddTab(preview, document.name.Mid(behind)));
  return preview;
}

LRESULT WorkbenchFrame::OnDropFiles(WPARAM drop, LPARAM) {
  const auto files = reinterpret_cast<HDROP>(drop);
  const UINT count = ::DragQueryFileW(files, ~UINT{0}, nullptr, 0);
  const UINT length = ::DragQueryFileW(files, 0, nullptr, 0);
  std::vector<WCHAR> path(length + 1);
  ::DragQueryFileW(files, 0, path.data(), length + 1);
  ::DragFinish(files);
  Try([&] {
    if (count > 1) throw Failure{"one folder can be open, and " + std::to_string(count) + " were dropped"};
    OpenFolder(path.data());
  });
  return 0;
}

void WorkbenchFrame::OnOpenFolder() {
  const SString folder = m_detection.Folder().IsEmpty() ? ReadSetting(kFolderSetting) : m_detection.Folder();
  TextDialog dialog(WTEXT("Open Folder"), WTEXT("The folder with the texts:"), ShownPath(folder));
  if (dialog.DoModal() != IDOK || dialog.GetText().IsEmpty()) return;
  Try([&] { OpenFolder(console::NameOf(ToUtf8(dialog.GetText()))); });
}

void WorkbenchFrame::OnRefresh() {
  Try([this] { OpenFolder(SString(m_detection.Folder())); });
}

void WorkbenchFrame::OnPreview() {
  if (m_list->Focused() >= 0) ShowPreview(m_list->Focused());
}

void WorkbenchFrame::OnClosePreview() {
  int tab = -1;
  if (m_tabs.GetActiveTab(&tab) == nullptr) return;
  m_tabs.DeleteTab(tab);
  if (m_tabs.GetTabCount() > 0) return;
  m_tabs.ShowScrollBar(SB_BOTH, 0);
  m_list->SetFocus();
}

void WorkbenchFrame::OnPart(UINT id) {
  PreviewView* preview = CurrentPreview();
  if (preview != nullptr) preview->GoToPart(preview->Text().Part() + (id == kNextPart ? 1 : -1));
}

void WorkbenchFrame::OnViewAs(UINT id) {
  PreviewView* preview = CurrentPreview();
  if (preview == nullptr) return;
  Try([&] {
    if (id == kViewDetected) return preview->Show(preview->Detected());
    if (id != kViewOther) return preview->Show(EncodingOf(kUsualEncodings[id - kViewFirst], "Encoding"));
    TextDialog dialog(WTEXT("View As"), WTEXT("The encoding to read it in:"), ShownName(preview->Text().GetEncoding()));
    if (dialog.DoModal() == IDOK) preview->Show(EncodingOf(ToUtf8(dialog.GetText()), "Encoding"));
  });
}

void WorkbenchFrame::OnAbout() {
  MessageBoxW(WTEXT("qxcore workbench ") + FromUtf8(QXWORKBENCH_VERSION) +
                  WTEXT("\nLists old texts, finds out their encodings, shows and converts them."),
              WTEXT("About"), MB_OK | MB_ICONINFORMATION);
}

// --- conversion ---

// As the user sees it; what has no preview, as detected.
Encoding WorkbenchFrame::ReadAs(const Document& document) const {
  const PreviewView* preview = FindPreview(document.native);
  return (preview != nullptr ? preview->Text().GetEncoding() : document.encoding) & Encodings::kValueMask;
}

void WorkbenchFrame::ConvertSelected(Encoding to, const SString& folder) {
  if (m_conversion.IsRunning()) throw Failure{"a conversion runs already"};
  RequireOnThisMachine(to);
  std::vector<ConversionItem> items;
  for (const int number : m_documents.Selected()) {
    const Document& document = m_documents.At(number);
    ConversionItem item{
        document.native, document.name, number, ReadAs(document), TargetOf(document, folder), SString(), "", false};
    if (document.state == Document::State::kWaiting) item.error = "its encoding is not known yet";
    if (document.state == Document::State::kFailed) item.error = ToUtf8(document.warning);
    items.push_back(std::move(item));
  }
  if (items.empty()) throw Failure{"no file is selected"};
  m_workBegan = ::GetTickCount();
  m_entered = 0;
  m_conversion.Start(std::move(items), to);
}

void WorkbenchFrame::OnConvert() {
  TextDialog dialog(WTEXT("Convert"), WTEXT("The encoding to convert the selected files to, in their places:"),
                    WTEXT("UTF-8"));
  if (dialog.DoModal() != IDOK) return;
  Try([&] { ConvertSelected(EncodingOf(ToUtf8(dialog.GetText()), "Convert"), SString()); });
}
