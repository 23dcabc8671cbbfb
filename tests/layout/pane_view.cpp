#include "tests/layout/layout_fixture.h"

namespace test {
QXCORE_IMPLEMENT_CREATABLE_CLASS(PaneView, SView, 2)
}  // namespace test
