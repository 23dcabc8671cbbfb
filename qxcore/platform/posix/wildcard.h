// File name patterns as Windows reads them, without regard to case.
//
// "*" is any run and "?" any one character; as there, "*.*" fits names without a dot, too, a "?" before
// a dot or at the end may stand for nothing, and "*." fits names without a dot only.
#pragma once

#include <string>
#include <string_view>

namespace platform {

// Brings a pattern into the form that MatchesWildcard takes.
std::u16string CompileWildcard(std::u16string_view mask);

bool MatchesWildcard(std::u16string_view compiled, std::u16string_view name);

}  // namespace platform
