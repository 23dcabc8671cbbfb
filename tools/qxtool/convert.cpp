// qxtool convert: files from one encoding to another.

#include "tools/qxtool/text_pipe.h"

int Convert(const TextPipeOptions& options) {
  return PipeText(options, [](TextPass& pass) {
    while (pass.CopyPiece()) {
    }
  });
}
