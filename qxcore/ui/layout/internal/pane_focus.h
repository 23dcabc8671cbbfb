// The way of F6 through splitters and tab windows that lie in each other.
#pragma once

class SWnd;

class SPaneFocus {
 public:
  // True when a splitter or tab window around this one has somewhere else to go with F6.
  static bool HasOuterStop(const SWnd* window);
  // Moves the focus into a window: of a splitter, into its first or, backward, last pane; of a tab window, into the
  // window it shows or, backward, its beam.
  static void Enter(SWnd* window, bool backward);
};
