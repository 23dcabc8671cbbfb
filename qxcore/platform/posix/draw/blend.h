// Glyphs onto surfaces.
#pragma once

#include "qxcore/platform/posix/draw/context.h"
#include "qxcore/platform/posix/draw/sized_face.h"

namespace draw {

// Blends a colour into the part of a surface that a glyph's mask covers: each channel becomes the average of both,
// weighted by the mask and rounded. (x, y) is the mask's corner; only pixels within `clip` change, which must lie on
// the surface.
void BlendGlyph(const Surface& surface, const Box& clip, int x, int y, const Glyph& glyph, std::uint32_t pixel);

}  // namespace draw
