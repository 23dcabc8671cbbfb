// Metafiles: drawing calls that are recorded and played back on other contexts. Both kinds live in memory.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/dc.h"

// A recording, owned. The old kind plays where and as it was drawn; the enhanced kind plays into a rectangle.
class QXCORE_API SMetafile {
 public:
  SMetafile() = default;
  // The owner of a handle of either kind.
  explicit SMetafile(HMETAFILE metafile) : m_old(metafile) {}
  explicit SMetafile(HENHMETAFILE metafile) : m_enhanced(metafile) {}
  SMetafile(SMetafile&& other) noexcept;
  SMetafile& operator=(SMetafile&& other) noexcept;
  ~SMetafile();

  // True when there is a recording.
  explicit operator bool() const { return m_old || m_enhanced; }
  // Makes the recorded calls on a context. `rect` (logical units) is where the frame of an enhanced metafile comes to
  // lie; the old kind ignores it. Returns false without a recording or a valid context.
  bool Play(HDC dc, const SRect& rect = SRect()) const;

 private:
  HMETAFILE m_old = nullptr;
  HENHMETAFILE m_enhanced = nullptr;
};

// A context that records an old metafile.
class QXCORE_API SMetafileDC : public SDC {
  QXCORE_DECLARE_CREATABLE_CLASS(SMetafileDC)

  // GetSafeHdc() is null when the system refuses.
  SMetafileDC() { Attach(::CreateMetaFileW(nullptr)); }
  ~SMetafileDC() override;
  // Ends the recording and returns it; the context is without a handle then.
  SMetafile Close();
};

// A context that records an enhanced metafile.
class QXCORE_API SEnhMetafileDC : public SDC {
  QXCORE_DECLARE_CREATABLE_CLASS(SEnhMetafileDC)

  // With a frame in 0.01 mm; null leaves the frame out.
  explicit SEnhMetafileDC(const RECT* frame = nullptr) {
    Attach(::CreateEnhMetaFileW(nullptr, nullptr, frame, nullptr));
  }
  ~SEnhMetafileDC() override;
  // As that of SMetafileDC.
  SMetafile Close();
};
