// From one text file to another: what convert, escape and unescape have in common.
#pragma once

#include <functional>
#include <string>

#include "qxcore/stream/output_string_stream.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/text_source.h"

// Reads all of the source and writes to the target.
using TextWork = std::function<void(TextSource&, SOutputStringStream&)>;

// Opens both files, lets `work` do what is to be done between them, puts the new file in its place and tells
// what was lost. Throws what cannot be done as a Failure; the target is as it was then.
int PipeText(const TextPipeOptions& options, const TextWork& work);

// What `read` (into a buffer of some bytes) gives, 0 at the end of the source. Failures, a cut source and the
// user's wish to end are thrown, as those of the file `name`.
unsigned ReadPiece(TextSource& source, const std::string& name, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read);
