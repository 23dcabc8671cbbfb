#include "qxcore/graphics/metafile.h"

#include <utility>

QXCORE_IMPLEMENT_CREATABLE_CLASS(SMetafileDC, SDC, 1)
QXCORE_IMPLEMENT_CREATABLE_CLASS(SEnhMetafileDC, SDC, 1)

SMetafile::SMetafile(SMetafile&& other) noexcept
    : m_old(std::exchange(other.m_old, nullptr)), m_enhanced(std::exchange(other.m_enhanced, nullptr)) {}

SMetafile& SMetafile::operator=(SMetafile&& other) noexcept {
  std::swap(m_old, other.m_old);
  std::swap(m_enhanced, other.m_enhanced);
  return *this;
}

SMetafile::~SMetafile() {
  if (m_old) ::DeleteMetaFile(m_old);
  if (m_enhanced) ::DeleteEnhMetaFile(m_enhanced);
}

bool SMetafile::Play(HDC dc, const SRect& rect) const {
  if (m_old) return ::PlayMetaFile(dc, m_old) != 0;
  return m_enhanced && ::PlayEnhMetaFile(dc, m_enhanced, rect) != 0;
}

SMetafile SMetafileDC::Close() { return SMetafile(::CloseMetaFile(Detach())); }

// A context that records can only be closed, not deleted.
SMetafileDC::~SMetafileDC() {
  if (m_hDC) Close();
}

SMetafile SEnhMetafileDC::Close() { return SMetafile(::CloseEnhMetaFile(Detach())); }

SEnhMetafileDC::~SEnhMetafileDC() {
  if (m_hDC) Close();
}
