// The workbench's menu, its keys, and when its commands can be chosen.

#include <algorithm>
#include <iterator>

#include "qxcore/ui/window/command_ui.h"
#include "qxcore/ui/window/menu.h"
#include "tools/common/utf8.h"
#include "tools/qxworkbench/commands.h"
#include "tools/qxworkbench/frame.h"

namespace {

struct Item {
  UINT command;  // 0 for a line between groups
  LPCWSTR text;
};

constexpr Item kFile[] = {{kOpenFolder, WTEXT("&Open Folder...\tCtrl+O")},
                          {kRefresh, WTEXT("&Refresh\tF5")},
                          {0, nullptr},
                          {kCancelWork, WTEXT("&Cancel\tEsc")},
                          {0, nullptr},
                          {kExit, WTEXT("E&xit\tAlt+F4")}};
constexpr Item kEdit[] = {{kSelectAll, WTEXT("Select &All\tCtrl+A")}, {kConvert, WTEXT("&Convert...\tCtrl+E")}};
constexpr Item kSort[] = {{kSortFirst, WTEXT("By &Name\tCtrl+1")},
                          {kSortFirst + 1, WTEXT("By &Encoding\tCtrl+2")},
                          {kSortFirst + 2, WTEXT("By &Size\tCtrl+3")},
                          {kSortLast, WTEXT("By &Warning\tCtrl+4")}};
constexpr Item kShow[] = {{kPreview, WTEXT("&Show\tEnter")},
                          {kClosePreview, WTEXT("&Close\tCtrl+W")},
                          {0, nullptr},
                          {kNextPart, WTEXT("&Next Part\tCtrl+Down")},
                          {kPreviousPart, WTEXT("&Previous Part\tCtrl+Up")},
                          {0, nullptr},
                          {kViewDetected, WTEXT("As &Detected\tCtrl+D")}};
constexpr Item kHelp[] = {{kAbout, WTEXT("&About...")}};

constexpr ACCEL kKeys[] = {{FVIRTKEY | FCONTROL, 'O', kOpenFolder},    {FVIRTKEY, VK_F5, kRefresh},
                           {FVIRTKEY | FCONTROL, 'A', kSelectAll},     {FVIRTKEY | FCONTROL, 'E', kConvert},
                           {FVIRTKEY | FCONTROL, '1', kSortFirst},     {FVIRTKEY | FCONTROL, '2', kSortFirst + 1},
                           {FVIRTKEY | FCONTROL, '3', kSortFirst + 2}, {FVIRTKEY | FCONTROL, '4', kSortLast},
                           {FVIRTKEY | FCONTROL, 'W', kClosePreview},  {FVIRTKEY | FCONTROL, 'D', kViewDetected},
                           {FVIRTKEY, VK_ESCAPE, kCancelWork}};

template <std::size_t count>
void Append(SMenu& bar, LPCWSTR title, const Item (&items)[count], SMenu& menu) {
  for (const Item& item : items)
    menu.AppendMenuW(item.command == 0 ? MF_SEPARATOR : MF_STRING, item.command, item.text);
  bar.AppendMenuW(MF_POPUP, reinterpret_cast<UINT_PTR>(menu.Detach()), title);
}
template <std::size_t count>
void Append(SMenu& bar, LPCWSTR title, const Item (&items)[count]) {
  SMenu menu;
  menu.CreatePopupMenu();
  Append(bar, title, items, menu);
}

}  // namespace

void WorkbenchFrame::MakeMenu() {
  SMenu bar;
  bar.CreateMenu();
  Append(bar, WTEXT("&File"), kFile);
  Append(bar, WTEXT("&Edit"), kEdit);
  Append(bar, WTEXT("&Sort"), kSort);
  Append(bar, WTEXT("&Preview"), kShow);
  SMenu* preview = bar.GetSubMenu(3);
  UINT id = kViewFirst;
  for (const char* name : kUsualEncodings)
    preview->AppendMenuW(MF_STRING, id++, WTEXT("As ") + ShownName(EncodingOf(name, "menu")));
  preview->AppendMenuW(MF_STRING, kViewOther, WTEXT("As &Other..."));
  Append(bar, WTEXT("&Help"), kHelp);
  SetMenu(bar.Detach());  // the window destroys its menu
  ACCEL keys[std::size(kKeys)];
  std::copy(std::begin(kKeys), std::end(kKeys), keys);
  SetAccelTable(::CreateAcceleratorTableW(keys, static_cast<int>(std::size(keys))));
}

void WorkbenchFrame::OnUpdateNeedsFolder(SCmdUI* ui) { ui->Enable(!m_detection.Folder().IsEmpty()); }
void WorkbenchFrame::OnUpdateNeedsSelection(SCmdUI* ui) { ui->Enable(m_documents.SelectedCount() > 0); }
void WorkbenchFrame::OnUpdateNeedsPreview(SCmdUI* ui) { ui->Enable(CurrentPreview() != nullptr); }
void WorkbenchFrame::OnUpdateCancel(SCmdUI* ui) { ui->Enable(m_bar.InProgress()); }
void WorkbenchFrame::OnUpdateSort(SCmdUI* ui) {
  ui->SetRadio(static_cast<Column>(ui->GetID() - kSortFirst) == m_documents.SortColumn());
}

void WorkbenchFrame::OnUpdateViewAs(SCmdUI* ui) {
  const PreviewView* preview = CurrentPreview();
  ui->Enable(preview != nullptr);
  if (preview == nullptr || ui->GetID() == kViewOther) return;
  const Encoding shown = preview->Text().GetEncoding(), detected = preview->Detected() & Encodings::kValueMask;
  const UINT index = ui->GetID() - kViewFirst;
  if (ui->GetID() == kViewDetected) {
    ui->SetRadio(shown == detected);
  } else if (index < std::size(kUsualEncodings)) {
    ui->SetRadio(shown != detected && shown == EncodingOf(kUsualEncodings[index], "menu"));
  }
}
