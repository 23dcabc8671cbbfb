// qxtool convert: files from one encoding to another.

#include <vector>

#include "tools/qxtool/text_pipe.h"

int Convert(const TextPipeOptions& options) {
  return PipeText(options, [](PipeSource& source, TextTarget& target) {
    std::vector<WCHAR> text(32768);
    const unsigned size = static_cast<unsigned>(text.size() * sizeof(WCHAR));
    auto read = [&source](void* buffer, unsigned long bytes) { return source.text.Reader().Read(buffer, bytes); };
    while (unsigned bytes = ReadPiece(source, text.data(), size, read)) {
      target.Write(source.name, {text.data(), bytes / sizeof(WCHAR)});
    }
  });
}
