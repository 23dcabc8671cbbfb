#include "qxcore/stream/input_file.h"

QXCORE_IMPLEMENT_CLASS(SInputFile, SInputStream, 0)

SInputFile::SInputFile(const SString& path, SProgressIndicatorEx* progress) : SFileProgressHelper(path, progress) {}
SInputFile::~SInputFile() = default;
