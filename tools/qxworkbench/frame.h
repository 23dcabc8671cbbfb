// The workbench's window: the list and the previews with a splitter between them, the menu, and the status bar with
// progress and Cancel.
//
// The frame brings the model and the views together. Long work goes in steps: call Step from the idle time.
#pragma once

#include <functional>

#include "qxcore/ui/bar/progress_status_bar.h"
#include "qxcore/ui/frame/dock_site_frame.h"
#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/layout/tab_window.h"
#include "qxcore/ui/window/command_ui.h"
#include "tools/qxworkbench/conversion_job.h"
#include "tools/qxworkbench/detection_job.h"
#include "tools/qxworkbench/list_view.h"
#include "tools/qxworkbench/preview_view.h"

class WorkbenchFrame : public SDockSiteFrameWnd {
 public:
  WorkbenchFrame();

  // Does a part of the work that is left. True while there is more to do at once.
  bool Step();
  // Whether a job runs, also one that waits for its thread.
  bool IsBusy() const;

  // --- what menus, scripts and the command line ask for; each throws Failure when it cannot be done ---

  void OpenFolder(const SString& folder);
  // Shows a preview in a tab of its own, or the tab that it already has. Null for a document without a preview.
  PreviewView* ShowPreview(int number);
  // Begins to convert the selected documents. An empty folder converts them in their places, another one takes the
  // new files under their names. Nothing is written before somebody has agreed to the losses.
  void ConvertSelected(Encoding to, const SString& folder);
  // Presses Cancel; false when no work runs.
  bool CancelWork();

  DocumentList& Documents() { return m_documents; }
  FileListView& List() { return *m_list; }
  DetectionJob& Detection() { return m_detection; }
  const ConversionJob& Conversion() const { return m_conversion; }
  SSplitterWnd& Splitter() { return m_splitter; }
  PreviewView* CurrentPreview() const;  // null for none
  SString StatusText() { return m_bar.GetPaneText(kSMainPane); }

  // Says what went wrong: in the status bar, and to somebody who is there in a box. A script takes it instead by
  // setting its own function.
  void Report(const SString& text);
  void SetReporter(std::function<void(const SString&)> reporter) { m_reporter = std::move(reporter); }
  // Cancels as soon as this many files of a job are done; -1 never.
  void CancelAfter(int count) { m_cancelAfter = count; }

  int PreTranslateMessage(MSG* message) override;
  int OnCreateClient(CREATESTRUCTW* create, SCreateContext* context) override;

 protected:
  void OnDestroy();
  LRESULT OnDropFiles(WPARAM drop, LPARAM);
  LRESULT OnWorkIsDone(WPARAM, LPARAM);
  LRESULT OnInterrupted(WPARAM, LPARAM);

  void OnOpenFolder();
  void OnRefresh();
  void OnConvert();
  void OnPreview();
  void OnClosePreview();
  void OnSelectAll() { m_list->SelectAll(); }
  void OnCancelWork() { CancelWork(); }
  void OnPart(UINT id);
  void OnExit() { PostMessageW(WM_CLOSE); }
  void OnAbout();
  void OnSelectionChanged() { ShowCounts(); }
  void OnSort(UINT id) { m_list->SortBy(static_cast<Column>(id - 0x8020)); }
  void OnViewAs(UINT id);

  void OnUpdateNeedsFolder(SCmdUI* ui);
  void OnUpdateNeedsSelection(SCmdUI* ui);
  void OnUpdateNeedsPreview(SCmdUI* ui);
  void OnUpdateCancel(SCmdUI* ui);
  void OnUpdateSort(SCmdUI* ui);
  void OnUpdateViewAs(SCmdUI* ui);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  void MakeMenu();
  void MakeBar();
  void RestoreSplitter();
  void StepDetection();
  void StepConversion();
  void EnterConverted();
  bool StepPreviews();
  void AskAndWrite();
  Encoding ReadAs(const Document& document) const;
  PreviewView* FindPreview(const std::string& native) const;
  void ShowList();
  TimeSlice Slice() const;
  void ShowProgress(int done, int total);
  void EndProgress();
  bool CancelWasPressed(int done);
  void ShowCounts();
  void Say(const SString& text);
  // Does what a command asks for, and reports what it throws.
  template <class Work>
  void Try(const Work& work);

  DocumentList m_documents;
  DetectionJob m_detection;
  ConversionJob m_conversion;
  SSplitterWnd m_splitter;
  STabWnd m_tabs;
  SProgressStatusBar m_bar;
  FileListView* m_list = nullptr;  // ends with its window
  std::function<void(const SString&)> m_reporter;
  int m_cancelAfter = -1;
  int m_entered = 0;      // how many converted files the list knows of
  DWORD m_workBegan = 0;  // milliseconds
  DWORD m_listShown = 0;  // the same
  bool m_wasDetecting = false;
  bool m_isAsking = false;
};
