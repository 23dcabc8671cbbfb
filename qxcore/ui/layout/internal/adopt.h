// Windows that exist already as panes and tabs.
#pragma once

class SWnd;

// Makes a window a child of `parent`. A pane of another splitter, or a tab of another tab window, is taken out there.
void SAdopt(SWnd* window, SWnd* parent);
