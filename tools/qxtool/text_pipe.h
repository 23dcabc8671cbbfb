// From text files to others: what convert, escape and unescape have in common.
#pragma once

#include <functional>
#include <string>

#include "tools/qxtool/commands.h"
#include "tools/qxtool/text_source.h"
#include "tools/qxtool/text_target.h"

// One file that is read, by its name in messages, and what reads it.
struct PipeSource {
  std::string name;
  TextSource& text;
};

// Reads all of the source and writes to the target.
using TextWork = std::function<void(PipeSource&, TextTarget&)>;

// Opens each pair of files, lets `work` do what is to be done between them, puts the new file in its place and says
// what was lost. Of one pair, throws what cannot be done as a Failure; of several, says it and goes on. A target that
// could not be made is as it was. Returns kDone, kLossy when characters were lost, or kFailed.
int PipeText(const TextPipeOptions& options, const TextWork& work);

// What `read` (into a buffer of some bytes) returns, 0 at the end of the source. Failures, a cut source and the
// user's wish to end are thrown, as those of the source.
unsigned ReadPiece(PipeSource& source, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read);
