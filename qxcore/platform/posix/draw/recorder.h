// Metafiles: the calls of a context, kept in order, to be made again on another one.
#pragma once

#include <functional>
#include <vector>

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

using Call = std::function<void(HDC)>;

class Recorder {
 public:
  // Keeps a call. A recording for which memory is short is not handed out.
  template <class F>
  void Add(F&& call) noexcept {
    try {
      m_calls.emplace_back(std::forward<F>(call));
    } catch (const std::bad_alloc&) {
      m_isBroken = true;
    }
  }

  std::vector<Call> m_calls;
  bool m_isBroken = false;
  RECT m_frame{};  // of an enhanced metafile, in pixels; empty without one
};

// Keeps a call that the context records instead of drawing; false when it records nothing.
template <class F>
bool Record(Context& dc, F call) {
  if (!dc.m_recorder) [[likely]]
    return false;
  dc.m_recorder->Add(std::move(call));
  return true;
}

class Metafile final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_METAFILE || type == OBJ_ENHMETAFILE; }
  Metafile(DWORD type, std::vector<Call> calls, RECT frame) : Object(type), m_calls(std::move(calls)), m_frame(frame) {}
  std::vector<Call> m_calls;
  RECT m_frame;  // as the recorder's
};

}  // namespace draw
