#include "qxcore/ui/frame/data_exchange.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>

#include "qxcore/core/module_state.h"
#include "qxcore/ui/app/message_box.h"
#include "qxcore/ui/window/thread_state.h"

namespace {

constexpr unsigned int kNoWholeNumber = 281;
constexpr unsigned int kNoNumber = 282;
constexpr unsigned int kTooLong = 283;
constexpr unsigned int kOutOfRange = 284;

// The whole text as a number, blanks around it aside; the same in every locale.
bool ParseNumber(const SString& text, double* value) {
  const std::string bytes = text.ToUtf8();
  const char* begin = bytes.c_str();
  char* end = nullptr;
  *value = std::strtod(begin, &end);
  if (end == begin || !std::isfinite(*value)) return false;
  while (*end == ' ' || *end == '\t') ++end;
  return *end == '\0';
}

}  // namespace

HWND SDataExchange::Control(int id) {
  m_last = ::GetDlgItem(m_window->GetSafeHwnd(), id);
  return m_last;
}

SString SDataExchange::TextOf(HWND control) {
  SString text;
  SWnd::FromHandle(control)->GetWindowTextW(&text);
  return text;
}

// A missing control exchanges nothing.
void SDataExchange::Text(int id, SString* value) {
  const HWND control = Control(id);
  if (control == nullptr) return;
  if (m_save) {
    *value = TextOf(control);
  } else if (TextOf(control) != *value) {
    SSent(::SetWindowTextW(control, *value));
  }
}

void SDataExchange::Number(int id, std::int32_t* value) {
  SString text;
  if (!m_save) text.Format(WTEXT("%d"), *value);
  Text(id, &text);
  if (!m_save || m_last == nullptr) return;
  double number = 0;
  if (!ParseNumber(text, &number) || number != std::trunc(number) || std::fabs(number) > 2147483648.0 ||
      number == 2147483648.0) {
    Fail(SCoreGetModuleState()->LoadStringW(kNoWholeNumber));
  }
  *value = static_cast<std::int32_t>(number);
}

void SDataExchange::Number(int id, double* value) {
  SString text;
  if (!m_save) text.Format(WTEXT("%.15g"), *value);
  Text(id, &text);
  if (!m_save || m_last == nullptr) return;
  double number = 0;
  if (!ParseNumber(text, &number)) Fail(SCoreGetModuleState()->LoadStringW(kNoNumber));
  *value = number;
}

void SDataExchange::Check(int id, int* value) {
  const HWND control = Control(id);
  if (control == nullptr) return;
  if (m_save) {
    *value = static_cast<int>(SSent(::SendMessageW(control, BM_GETCHECK, 0, 0)));
  } else {
    SSent(::SendMessageW(control, BM_SETCHECK, static_cast<WPARAM>(*value), 0));
  }
}

void SDataExchange::Radio(int firstId, int* index) {
  HWND control = Control(firstId);
  if (m_save) *index = -1;
  for (int i = 0; control != nullptr; ++i) {
    if (m_save) {
      if (SSent(::SendMessageW(control, BM_GETCHECK, 0, 0)) == BST_CHECKED) *index = i;
    } else {
      SSent(::SendMessageW(control, BM_SETCHECK, i == *index ? BST_CHECKED : BST_UNCHECKED, 0));
    }
    control = ::GetWindow(control, GW_HWNDNEXT);
    if (control != nullptr && (::GetWindowLongW(control, GWL_STYLE) & WS_GROUP) != 0) break;
  }
}

void SDataExchange::MaxLength(const SString& value, int count) {
  if (!m_save) {
    if (m_last != nullptr) SSent(::SendMessageW(m_last, EM_LIMITTEXT, static_cast<WPARAM>(count), 0));
  } else if (value.Length() > count) {
    Fail(SCoreGetModuleState()->Format(kTooLong, count));
  }
}

void SDataExchange::Range(std::int32_t value, std::int32_t low, std::int32_t high) {
  Range(static_cast<double>(value), static_cast<double>(low), static_cast<double>(high));
}

void SDataExchange::Range(double value, double low, double high) {
  if (m_save && !(low <= value && value <= high)) Fail(SCoreGetModuleState()->Format(kOutOfRange, low, high));
}

void SDataExchange::Fail(const SString& message) {
  const HWND control = m_last;
  SMessageBox(message, MB_OK | MB_ICONEXCLAMATION, nullptr, m_window->GetSafeHwnd());
  if (::IsWindow(control)) {
    ::SetFocus(control);
    SSent(::SendMessageW(control, EM_SETSEL, 0, -1));
  }
  throw SDataExchangeFailed();
}
