// What a dialog template in the published binary layout says about the box.
#pragma once

#include "qxcore/string/string.h"

// The caption of the box; empty when there is none.
SString SDialogTemplateCaption(const void* dialogTemplate);
