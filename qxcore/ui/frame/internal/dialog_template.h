// What a dialog template in the published binary layout says about the box.
#pragma once

#include "qxcore/string/string.h"

// The caption of the box; empty for a box without a caption.
SString SDialogTemplateCaption(const void* dialogTemplate);
