// From text files to others: what convert, escape and unescape have in common.
#pragma once

#include <functional>
#include <string>

#include "tools/common/text_pass.h"
#include "tools/qxtool/commands.h"

// Reads all of the pass's source and writes to its target.
using TextWork = std::function<void(TextPass&)>;

// Opens each pair of files, lets `work` do what is to be done between them, puts the new file in its place and says
// what was lost. Of one pair, throws what cannot be done as a Failure; of several, says it and goes on. A target that
// could not be made is as it was. Returns kDone, kLossy when characters were lost, or kFailed.
int PipeText(const TextPipeOptions& options, const TextWork& work);
