// What of the windows must be painted. Regions are relative to a window's top left corner.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// All under the lock, up to EraseNow.

enum class Erase { No, Yes };
enum class Children { No, Unclipped, All };
// Adds to what must be painted of a window, and of the children that lie there: none, those that the style
// WS_CLIPCHILDREN does not keep out, or all.
void Invalidate(Window* window, const Region& region, Erase erase, Children children);
// What must be painted of a window itself: without its children's places, where it leaves them out.
Region UpdateOf(const Window* window);
// Takes away, the children's as well if asked.
void Validate(Window* window, const Region* region, Children children);
// Something was taken from what is to be painted of the window.
void ForgetAllInvalid(Window* window);
// Whether all of the client area is to be painted, and erased before if asked.
bool IsClientInvalid(const Window* window, Erase erase);
// Whether a window without children has nothing on the screen that is worth keeping: all that shows of it is yet to be
// erased and painted.
bool IsUnpainted(const Window* window);
// Forgets all that is to be painted of a window that does not show any more, and of what is below it.
void DropPaint(Window* window);
// Counts the window among those that want WM_PAINT, or no longer.
void SetWantsPaint(Window* window, bool wants);
// After a change of place of a window that was shown: what comes to light of the parent and of siblings. Returns
// whether anything did.
bool UncoverByMove(Window* window, const RECT& oldWindow);
// The same for what came to light between the children of a window, relative to its client area.
void UncoverBetween(Window* parent, Region uncovered);
// After a change of place of a window that shows: what must be painted of it.
void SpoilByMove(Window* window, const RECT& oldWindow, const RECT& oldClient, bool wasShown, UINT flags);
// After a change in the Z order: where the window and its siblings overlap.
void SpoilByOrder(Window* window);
// Whether erasing must wait until a parent has been painted.
bool WaitsForParent(const Window* window);
// What the parents' client areas leave of the window; relative to it.
RECT ClipByParents(const Window* window);
// The part of the window that shows: without what parents cut off and what siblings above and children cover
// where the styles say so. Relative to the window.
void VisibleRegion(const Window* window, bool withoutChildren, Region* region);

// Sends WM_NCPAINT and WM_ERASEBKGND if they are due. Without the lock.
void EraseNow(HWND window);

}  // namespace platform::model
