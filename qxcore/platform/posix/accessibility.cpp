// There is no program that asks by WM_GETOBJECT; accessible objects are read directly.

#include "qxcore/platform/internal/accessibility.h"

namespace platform {

LRESULT AnswerGetObject(WPARAM, std::unique_ptr<AccessibleSource>) { return 0; }

}  // namespace platform
