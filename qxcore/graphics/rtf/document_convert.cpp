#include "qxcore/graphics/rtf/document.h"

void SRtfDocument::DeleteEditCtrl() {}
