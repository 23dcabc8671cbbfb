// The hidden rich-edit control that converts between text and RTF: the system's where there is one.
#pragma once

#include <memory>
#include <string>

#include "qxcore/platform/win32.h"

namespace platform {

class RichText {
 public:
  virtual ~RichText() = default;
  // Null when it cannot be made.
  static std::unique_ptr<RichText> Make();

  // Replaces the content by a terminated text, which is read as RTF or taken as it is; false on failure.
  virtual bool Load(SStringView text, bool isRtf) = 0;
  // The plain text, lines ending with CR LF.
  virtual std::size_t TextLength() = 0;
  // Fills exactly TextLength() characters and a terminator.
  virtual void GetText(WCHAR* text) = 0;
  // The content as RTF.
  virtual std::string GetRtf() = 0;
};

}  // namespace platform
