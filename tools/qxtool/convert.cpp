// qxtool convert: one file from one encoding to another.

#include <vector>

#include "tools/qxtool/text_pipe.h"

int Convert(const TextPipeOptions& options) {
  return PipeText(options, [&options](TextSource& source, SOutputStringStream& target) {
    std::vector<WCHAR> text(32768);
    const unsigned size = static_cast<unsigned>(text.size() * sizeof(WCHAR));
    auto read = [&source](void* buffer, unsigned long bytes) { return source.Reader().Read(buffer, bytes); };
    while (unsigned bytes = ReadPiece(source, options.in, text.data(), size, read)) {
      target.Write(text.data(), bytes / static_cast<unsigned>(sizeof(WCHAR)));
    }
  });
}
