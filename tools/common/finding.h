// What detection finds out about a file.
#pragma once

#include <string>

#include "qxcore/stream/progress_indicator.h"
#include "tools/common/encoding_option.h"

struct Finding {
  SString file;      // its name as it is shown
  SString encoding;  // the encoding's name as it is shown
  Encoding value = 0;
  bool bom = false;  // it starts with the mark of its encoding
  bool xml = false;
  unsigned long long bytes = 0;
  SString warning;    // of detection; empty for none
  std::string error;  // why it could not be looked at; then the rest is empty
};

// How a file is looked at when nothing else is asked for: all of its bytes, by the published standards, with the
// active code page as the hint.
inline constexpr Encoding kUsualRequest =
    Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess | Encodings::kFullUnicode;

// Looks at a file, or at standard input for "-". `progress` is as TextSource takes it; its wish to end throws
// SEIOAbortedException, everything else that goes wrong stands in the finding.
Finding LookAt(const std::string& name, Encoding request, SProgressIndicatorEx* progress = nullptr);
