#include "qxcore/graphics/picture.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "qxcore/core/exception.h"
#include "qxcore/platform/internal/png.h"

namespace {

HRESULT LastError() {
  DWORD code = ::GetLastError();
  return static_cast<HRESULT>(code ? 0x80070000u | (code & 0xFFFF) : static_cast<DWORD>(E_FAIL));
}

// A file handle that closes itself.
class OpenedFile {
 public:
  OpenedFile(const SString& name, DWORD access, DWORD disposition)
      : m_handle(::CreateFileW(name, access, FILE_SHARE_READ, nullptr, disposition, FILE_ATTRIBUTE_NORMAL, nullptr)) {}
  ~OpenedFile() { Close(); }
  OpenedFile(const OpenedFile&) = delete;
  OpenedFile& operator=(const OpenedFile&) = delete;

  bool IsOpen() const { return m_handle != INVALID_HANDLE_VALUE; }
  HANDLE Handle() const { return m_handle; }
  bool Close() {
    HANDLE handle = m_handle;
    m_handle = INVALID_HANDLE_VALUE;
    return handle == INVALID_HANDLE_VALUE || ::CloseHandle(handle);
  }

 private:
  HANDLE m_handle;
};

HRESULT WriteInto(const SString& name, DWORD disposition, const std::vector<BYTE>& bytes) {
  OpenedFile file(name, GENERIC_WRITE, disposition);
  if (!file.IsOpen()) return LastError();
  DWORD written = 0;
  bool whole = ::WriteFile(file.Handle(), bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr) &&
               written == bytes.size();
  HRESULT result = whole ? S_OK : LastError();
  if (!file.Close() && whole) result = LastError();
  return result;
}

HRESULT WriteNew(const SString& name, const std::vector<BYTE>& bytes) {
  HRESULT result = WriteInto(name, CREATE_NEW, bytes);
  if (result != S_OK && result != static_cast<HRESULT>(0x80070000u | ERROR_FILE_EXISTS)) ::DeleteFileW(name);
  return result;
}

// A copy of a file beside it, under a name that was free, which is deleted unless it takes the file's place. It is a
// copy so that it has the rights and attributes of the file.
class Draft {
 public:
  explicit Draft(const SString& file) : m_file(file) {
    constexpr int kMostNames = 100;
    for (int i = 0; i < kMostNames; ++i) {
      m_name.Format(WTEXT("%s.%d.new"), static_cast<LPCWSTR>(file), i);
      m_isThere = ::CopyFileW(file, m_name, TRUE);
      if (m_isThere || ::GetLastError() != ERROR_FILE_EXISTS) return;
    }
  }
  ~Draft() {
    if (m_isThere) ::DeleteFileW(m_name);
  }
  Draft(const Draft&) = delete;
  Draft& operator=(const Draft&) = delete;

  bool IsThere() const { return m_isThere; }
  const SString& Name() const { return m_name; }
  bool TakePlace() {
    bool taken = ::MoveFileExW(m_name, m_file, MOVEFILE_REPLACE_EXISTING);
    m_isThere = !taken;
    return taken;
  }

 private:
  const SString& m_file;
  SString m_name;
  bool m_isThere = false;
};

HRESULT Replace(const SString& name, const std::vector<BYTE>& bytes) {
  Draft draft(name);
  if (!draft.IsThere()) return LastError();
  HRESULT result = WriteInto(draft.Name(), TRUNCATE_EXISTING, bytes);
  return result != S_OK || draft.TakePlace() ? result : LastError();
}

HRESULT WriteBytes(const SString& name, const std::vector<BYTE>& bytes) {
  DWORD attributes = ::GetFileAttributesW(name);
  if (attributes == INVALID_FILE_ATTRIBUTES) return WriteNew(name, bytes);
  if (attributes & FILE_ATTRIBUTE_DEVICE) return WriteInto(name, OPEN_EXISTING, bytes);
  // Who may not write the file may not replace it, either.
  if (!OpenedFile(name, GENERIC_WRITE, OPEN_EXISTING).IsOpen()) return LastError();
  return Replace(name, bytes);
}

HRESULT ReadBytes(const SString& name, std::vector<BYTE>* bytes) {
  constexpr LONGLONG kLargestFile = 256 << 20;
  OpenedFile file(name, GENERIC_READ, OPEN_EXISTING);
  if (!file.IsOpen()) return LastError();
  LARGE_INTEGER size;
  if (!::GetFileSizeEx(file.Handle(), &size)) return LastError();
  if (size.QuadPart > kLargestFile) return static_cast<HRESULT>(0x80070000u | ERROR_INVALID_DATA);
  bytes->resize(static_cast<std::size_t>(size.QuadPart));
  DWORD read = 0;
  if (!::ReadFile(file.Handle(), bytes->data(), static_cast<DWORD>(bytes->size()), &read, nullptr)) return LastError();
  bytes->resize(read);
  return S_OK;
}

// The pixels of a bitmap of any depth, rows from the top.
bool GetPixels(HBITMAP bitmap, platform::Pixels* pixels) {
  BITMAP description;
  if (!::GetObjectW(bitmap, sizeof description, &description)) return false;
  pixels->width = description.bmWidth;
  pixels->height = description.bmHeight;
  pixels->data.resize(static_cast<std::size_t>(description.bmWidth) * static_cast<std::size_t>(description.bmHeight));
  BITMAPINFO info{};
  info.bmiHeader = {sizeof info.bmiHeader, description.bmWidth, -description.bmHeight, 1, 32, BI_RGB, 0, 0, 0, 0, 0};
  HDC screen = ::GetDC(nullptr);
  int lines =
      ::GetDIBits(screen, bitmap, 0, static_cast<UINT>(pixels->height), pixels->data.data(), &info, DIB_RGB_COLORS);
  ::ReleaseDC(nullptr, screen);
  return lines == pixels->height;
}

class WholeBitmap final : public platform::PixelRows {
 public:
  explicit WholeBitmap(const platform::Pixels& pixels) : m_pixels(pixels) {}
  SIZE Size() const override { return {m_pixels.width, m_pixels.height}; }
  const std::uint32_t* Read(int, int* count) override {
    *count = m_pixels.height;
    return m_pixels.data.data();
  }

 private:
  const platform::Pixels& m_pixels;
};

// What a context shows, a few rows at a time, so that there is no copy of all of it.
class ContextRows final : public platform::PixelRows {
 public:
  ContextRows(const SDC& source, const SRect& area)
      : m_source(source), m_area(area), m_band(source), m_isMade(m_bitmap.CreatePixels(area.Width(), kBandRows)) {}
  bool IsMade() const { return m_isMade; }
  SIZE Size() const override { return m_area.Size(); }
  const std::uint32_t* Read(int first, int* count) override {
    *count = std::min(kBandRows, m_area.Height() - first);
    {
      const SSelectObject selected(m_band, m_bitmap.m_hObject);
      const SRect rows(0, 0, m_area.Width(), *count);
      if (!m_band.BitBlt(rows, m_source, SPoint(m_area.left, m_area.top + first))) return nullptr;
    }
    ::GdiFlush();
    return m_bitmap.GetBits();
  }

 private:
  static constexpr int kBandRows = 64;
  const SDC& m_source;
  const SRect m_area;
  SMemoryDC m_band;
  SBitmap m_bitmap;
  bool m_isMade;
};

HRESULT Write(const SString& file, platform::PixelRows& rows) {
  std::vector<BYTE> bytes;
  HRESULT result = platform::EncodePng(rows, &bytes);
  return result == S_OK ? WriteBytes(file, bytes) : result;
}

HRESULT Write(const SString& file, HBITMAP bitmap) {
  platform::Pixels pixels;
  if (!GetPixels(bitmap, &pixels)) return E_INVALIDARG;
  WholeBitmap rows(pixels);
  return Write(file, rows);
}

HRESULT Write(const SString& file, const SDC& source, const SRect& area) {
  if (source.GetSafeHdc() == nullptr || area.IsEmpty()) return E_INVALIDARG;
  ContextRows rows(source, area);
  return rows.IsMade() ? Write(file, rows) : E_OUTOFMEMORY;
}

HRESULT Read(const SString& file, SBitmap* bitmap) {
  std::vector<BYTE> bytes;
  platform::Pixels pixels;
  HRESULT result = ReadBytes(file, &bytes);
  if (result == S_OK) result = platform::DecodePng(bytes.data(), bytes.size(), &pixels);
  if (result != S_OK) return result;
  SBitmap made;
  if (!made.CreatePixels(pixels.width, pixels.height)) return E_OUTOFMEMORY;
  std::memcpy(made.GetBits(), pixels.data.data(), pixels.data.size() * 4);
  bitmap->Attach(made.Detach());
  return S_OK;
}

// The standard containers report a shortage in their own way.
template <class F>
HRESULT WithMemory(F work) {
  try {
    return work();
  } catch (const std::bad_alloc&) {
    throw SEOutOfMemory();
  }
}

}  // namespace

HRESULT SWritePicture(const SString& file, HBITMAP bitmap) {
  return WithMemory([&] { return Write(file, bitmap); });
}

HRESULT SWritePicture(const SString& file, const SDC& source, const SRect& area) {
  return WithMemory([&] { return Write(file, source, area); });
}

HRESULT SReadPicture(const SString& file, SBitmap* bitmap) {
  return WithMemory([&] { return Read(file, bitmap); });
}
