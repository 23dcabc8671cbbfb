// PNG through the Windows Imaging Component. Its module and ole32 are loaded when they are first needed, so that a
// program without pictures does not pay for them.
#define INITGUID
#include "qxcore/platform/internal/png.h"

#include <objbase.h>
#include <wincodec.h>

namespace platform {

namespace {

constexpr HRESULT kInvalidData = static_cast<HRESULT>(0x80070000u | ERROR_INVALID_DATA);

// A counted pointer to an interface.
template <class T>
class Interface {
 public:
  Interface() = default;
  Interface(const Interface&) = delete;
  Interface& operator=(const Interface&) = delete;
  ~Interface() {
    if (m_pointer) m_pointer->Release();
  }
  T** operator&() { return &m_pointer; }
  T* operator->() const { return m_pointer; }
  T* get() const { return m_pointer; }

 private:
  T* m_pointer = nullptr;
};

template <class F>
F Function(const WCHAR* module, const char* name) {
  HMODULE loaded = LoadLibraryW(module);
  return loaded ? reinterpret_cast<F>(reinterpret_cast<void*>(GetProcAddress(loaded, name))) : nullptr;
}

// COM for this thread, as long as it is needed. A thread that has it already keeps its own kind.
class Com {
 public:
  Com() {
    auto start = Function<HRESULT(WINAPI*)(void*, DWORD)>(L"ole32.dll", "CoInitializeEx");
    m_started = start && SUCCEEDED(start(nullptr, COINIT_APARTMENTTHREADED));
  }
  ~Com() {
    auto end = Function<void(WINAPI*)()>(L"ole32.dll", "CoUninitialize");
    if (m_started && end) end();
  }
  Com(const Com&) = delete;
  Com& operator=(const Com&) = delete;

 private:
  bool m_started = false;
};

HRESULT MakeFactory(IWICImagingFactory** factory) {
  auto create =
      Function<HRESULT(WINAPI*)(REFCLSID, IUnknown*, DWORD, REFIID, void**)>(L"ole32.dll", "CoCreateInstance");
  if (!create) return E_NOTIMPL;
  return create(CLSID_WICImagingFactory, nullptr, CLSCTX_INPROC_SERVER, IID_IWICImagingFactory,
                reinterpret_cast<void**>(factory));
}

HRESULT MakeStream(IStream** stream) {
  auto create = Function<HRESULT(WINAPI*)(HGLOBAL, BOOL, IStream**)>(L"ole32.dll", "CreateStreamOnHGlobal");
  return create ? create(nullptr, TRUE, stream) : E_NOTIMPL;
}

void WithoutPadding(const std::uint32_t* pixels, std::size_t count, std::vector<BYTE>* bytes) {
  bytes->clear();
  bytes->reserve(count * 3);
  for (std::size_t i = 0; i < count; ++i) {
    for (int shift : {0, 8, 16}) bytes->push_back(static_cast<BYTE>(pixels[i] >> shift));
  }
}

// Stops at the first failure.
#define RETURN_IF_FAILED(call) \
  if (HRESULT result = (call); FAILED(result)) return result

HRESULT WriteRows(IWICBitmapFrameEncode* frame, PixelRows& rows) {
  const SIZE size = rows.Size();
  std::vector<BYTE> bytes;
  for (int first = 0, count = 0; first < size.cy; first += count) {
    const std::uint32_t* pixels = rows.Read(first, &count);
    if (pixels == nullptr) return E_FAIL;
    WithoutPadding(pixels, static_cast<std::size_t>(size.cx) * static_cast<std::size_t>(count), &bytes);
    const UINT stride = static_cast<UINT>(size.cx) * 3;
    RETURN_IF_FAILED(
        frame->WritePixels(static_cast<UINT>(count), stride, static_cast<UINT>(bytes.size()), bytes.data()));
  }
  return S_OK;
}

HRESULT Write(IWICImagingFactory* factory, PixelRows& rows, IStream* stream) {
  Interface<IWICBitmapEncoder> encoder;
  RETURN_IF_FAILED(factory->CreateEncoder(GUID_ContainerFormatPng, nullptr, &encoder));
  RETURN_IF_FAILED(encoder->Initialize(stream, WICBitmapEncoderNoCache));
  Interface<IWICBitmapFrameEncode> frame;
  RETURN_IF_FAILED(encoder->CreateNewFrame(&frame, nullptr));
  RETURN_IF_FAILED(frame->Initialize(nullptr));
  RETURN_IF_FAILED(frame->SetSize(static_cast<UINT>(rows.Size().cx), static_cast<UINT>(rows.Size().cy)));
  WICPixelFormatGUID format = GUID_WICPixelFormat24bppBGR;
  RETURN_IF_FAILED(frame->SetPixelFormat(&format));
  RETURN_IF_FAILED(WriteRows(frame.get(), rows));
  RETURN_IF_FAILED(frame->Commit());
  return encoder->Commit();
}

// All bytes of a stream.
HRESULT ReadAll(IStream* stream, std::vector<BYTE>* bytes) {
  STATSTG status{};
  RETURN_IF_FAILED(stream->Stat(&status, STATFLAG_NONAME));
  RETURN_IF_FAILED(stream->Seek(LARGE_INTEGER{}, STREAM_SEEK_SET, nullptr));
  bytes->resize(static_cast<std::size_t>(status.cbSize.QuadPart));
  ULONG read = 0;
  RETURN_IF_FAILED(stream->Read(bytes->data(), static_cast<ULONG>(bytes->size()), &read));
  return read == bytes->size() ? S_OK : E_FAIL;
}

std::uint32_t OverWhite(const BYTE* bgra) {
  auto channel = [alpha = std::uint32_t{bgra[3]}](BYTE value) {
    return (value * alpha + 255 * (255 - alpha) + 127) / 255;
  };
  return channel(bgra[0]) | channel(bgra[1]) << 8 | channel(bgra[2]) << 16;
}

HRESULT Read(IWICImagingFactory* factory, IStream* stream, Pixels* pixels) {
  Interface<IWICBitmapDecoder> decoder;
  RETURN_IF_FAILED(factory->CreateDecoder(GUID_ContainerFormatPng, nullptr, &decoder));
  RETURN_IF_FAILED(decoder->Initialize(stream, WICDecodeMetadataCacheOnDemand));
  Interface<IWICBitmapFrameDecode> frame;
  RETURN_IF_FAILED(decoder->GetFrame(0, &frame));
  Interface<IWICFormatConverter> converter;
  RETURN_IF_FAILED(factory->CreateFormatConverter(&converter));
  RETURN_IF_FAILED(converter->Initialize(frame.get(), GUID_WICPixelFormat32bppBGRA, WICBitmapDitherTypeNone, nullptr, 0,
                                         WICBitmapPaletteTypeCustom));
  UINT width = 0, height = 0;
  RETURN_IF_FAILED(converter->GetSize(&width, &height));
  if (width < 1 || height < 1 || width > kLargestSide || height > kLargestSide) return kInvalidData;
  std::vector<BYTE> rows(std::size_t{width} * height * 4);
  RETURN_IF_FAILED(converter->CopyPixels(nullptr, width * 4, static_cast<UINT>(rows.size()), rows.data()));
  pixels->width = static_cast<int>(width);
  pixels->height = static_cast<int>(height);
  pixels->data.resize(rows.size() / 4);
  for (std::size_t i = 0; i < pixels->data.size(); ++i) pixels->data[i] = OverWhite(&rows[4 * i]);
  return S_OK;
}

}  // namespace

HRESULT EncodePng(PixelRows& rows, std::vector<BYTE>* bytes) {
  bytes->clear();
  Com com;
  Interface<IWICImagingFactory> factory;
  Interface<IStream> stream;
  RETURN_IF_FAILED(MakeFactory(&factory));
  RETURN_IF_FAILED(MakeStream(&stream));
  RETURN_IF_FAILED(Write(factory.get(), rows, stream.get()));
  HRESULT result = ReadAll(stream.get(), bytes);
  if (FAILED(result)) bytes->clear();
  return result;
}

HRESULT DecodePng(const BYTE* bytes, std::size_t count, Pixels* pixels) {
  *pixels = Pixels();
  Com com;
  Interface<IWICImagingFactory> factory;
  Interface<IWICStream> stream;
  RETURN_IF_FAILED(MakeFactory(&factory));
  RETURN_IF_FAILED(factory->CreateStream(&stream));
  RETURN_IF_FAILED(stream->InitializeFromMemory(const_cast<BYTE*>(bytes), static_cast<DWORD>(count)));
  if (FAILED(Read(factory.get(), stream.get(), pixels))) {
    *pixels = Pixels();
    return kInvalidData;
  }
  return S_OK;
}

}  // namespace platform
