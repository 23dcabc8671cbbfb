// A font as it was asked for, and the face and size that it comes down to.
#pragma once

#include <atomic>

#include "qxcore/platform/posix/draw/object.h"

namespace draw {

class SizedFace;

class FontObject final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_FONT; }
  explicit FontObject(const LOGFONTW& description) : Object(OBJ_FONT), m_description(description) {}

  // The face at its size, found when first needed; null when there is no font at all. Never ended.
  SizedFace* Face() const;

  LOGFONTW m_description;

 private:
  mutable std::atomic<SizedFace*> m_face{nullptr};
};

}  // namespace draw
