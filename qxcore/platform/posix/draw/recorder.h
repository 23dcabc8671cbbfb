// Metafiles: the calls of a context, kept in order, to be made again on another one.
#pragma once

#include <functional>
#include <vector>

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

using Call = std::function<void(HDC)>;

class Recorder {
 public:
  void Add(Call call) { m_calls.push_back(std::move(call)); }

  std::vector<Call> m_calls;
  RECT m_frame{};  // of an enhanced metafile, in pixels; empty without one
};

// Keeps a call that the context records instead of drawing; false when it records nothing.
template <class F>
bool Record(Context& dc, F call) {
  if (!dc.m_recorder) [[likely]]
    return false;
  dc.m_recorder->Add(call);
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
