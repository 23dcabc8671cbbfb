// What SystemParametersInfoW knows.

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/memory.h"

using namespace platform::model;

namespace {

constexpr UINT kWheelLines = 3;

LOGFONTW InterfaceFont(int weight) {
  LOGFONTW font{};
  font.lfHeight = MulDiv(-11, static_cast<int>(GetDpiForSystem()), 96);
  font.lfWeight = weight;
  constexpr SStringView kFace = WTEXT("MS Shell Dlg");
  std::copy(kFace.begin(), kFace.end(), font.lfFaceName);
  return font;
}

void FillMetrics(NONCLIENTMETRICSW& metrics) {
  const LOGFONTW plain = InterfaceFont(400), bold = InterfaceFont(700);
  metrics.iBorderWidth = 1;
  metrics.iScrollWidth = GetSystemMetrics(SM_CXVSCROLL);
  metrics.iScrollHeight = GetSystemMetrics(SM_CYHSCROLL);
  metrics.iCaptionWidth = GetSystemMetrics(SM_CXSIZE);
  metrics.iCaptionHeight = GetSystemMetrics(SM_CYSIZE);
  metrics.lfCaptionFont = bold;
  metrics.iSmCaptionWidth = GetSystemMetrics(SM_CXSMSIZE);
  metrics.iSmCaptionHeight = GetSystemMetrics(SM_CYSMSIZE);
  metrics.lfSmCaptionFont = plain;
  metrics.iMenuWidth = GetSystemMetrics(SM_CXMENUSIZE);
  metrics.iMenuHeight = GetSystemMetrics(SM_CYMENUSIZE);
  metrics.lfMenuFont = metrics.lfStatusFont = metrics.lfMessageFont = plain;
}

}  // namespace

BOOL SystemParametersInfoW(UINT action, UINT, LPVOID data, UINT) {
  switch (action) {
    case SPI_GETWORKAREA:
      *static_cast<RECT*>(data) = platform::TheDisplay().WorkArea();
      return TRUE;
    case SPI_GETNONCLIENTMETRICS: {
      auto* metrics = static_cast<NONCLIENTMETRICSW*>(data);
      // Older programs leave the last field out.
      if (metrics->cbSize != sizeof *metrics && metrics->cbSize != sizeof *metrics - sizeof(int))
        return Fail(ERROR_INVALID_PARAMETER);
      FillMetrics(*metrics);
      if (metrics->cbSize == sizeof *metrics) metrics->iPaddedBorderWidth = 0;
      return TRUE;
    }
    case SPI_GETWHEELSCROLLLINES:
      *static_cast<UINT*>(data) = kWheelLines;
      return TRUE;
    case SPI_GETHIGHCONTRAST: {
      auto* contrast = static_cast<HIGHCONTRASTW*>(data);
      if (contrast->cbSize != sizeof *contrast) return Fail(ERROR_INVALID_PARAMETER);
      contrast->dwFlags = 0;
      contrast->lpszDefaultScheme = nullptr;
      return TRUE;
    }
    case SPI_GETFONTSMOOTHING:
    case SPI_GETMENUDROPALIGNMENT:
      *static_cast<BOOL*>(data) = FALSE;
      return TRUE;
    case SPI_GETDRAGFULLWINDOWS:
    case SPI_GETKEYBOARDCUES:
      *static_cast<BOOL*>(data) = TRUE;
      return TRUE;
    default:
      return Fail(ERROR_INVALID_PARAMETER);
  }
}
