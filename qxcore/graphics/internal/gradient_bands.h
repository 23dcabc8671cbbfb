// Filling an outline with parallel bands; `variant` is the mode's.
#pragma once

#include "qxcore/graphics/internal/gradient_outline.h"
#include "qxcore/graphics/internal/gradient_ramp.h"

void FillRows(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant);
void FillColumns(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant);
// From the bottom left corner to the top right one, or from the top left corner to the bottom right one.
void FillDiagonals(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant,
                   bool up);
