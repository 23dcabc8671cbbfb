#include "tools/common/failure.h"

#include <cstdio>
#include <exception>
#include <new>

#include "qxcore/core/exception.h"
#include "qxcore/core/io_exceptions.h"
#include "tools/common/utf8.h"

static const char* g_programName = "qxtool";

void SetProgramName(const char* name) { g_programName = name; }

void Complain(std::string_view text) {
  std::string line = std::string(g_programName) + ": ";
  // Names come from outside; control characters in them could steer the screen.
  for (char c : text) line += c == '\n' || c == '\r' ? ' ' : (c >= 0 && c < ' ') || c == '\x7F' ? '?' : c;
  line += '\n';
  std::fwrite(line.data(), 1, line.size(), stderr);
}

namespace {

std::string TrimmedUtf8(SStringView text) {
  std::string trimmed = ToUtf8(text);
  while (!trimmed.empty() && (trimmed.back() == '\n' || trimmed.back() == '\r' || trimmed.back() == ' '))
    trimmed.pop_back();
  return trimmed;
}

}  // namespace

std::string SystemText(unsigned long error) {
  WCHAR text[512];
  const DWORD length = FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
                                      static_cast<DWORD>(error), 0, text, 512, nullptr);
  return length > 0 ? TrimmedUtf8({text, length}) : "error " + std::to_string(error);
}

std::string ReasonOfCurrentException() {
  try {
    throw;
  } catch (const SEIOAbortedException&) {
    throw;
  } catch (const BrokenPipe&) {
    throw;
  } catch (const Failure& failure) {
    return failure.text;
  } catch (const SException& e) {
    const std::string text = TrimmedUtf8(e.GetText());
    if (!text.empty()) return text;
    char code[32];
    std::snprintf(code, sizeof code, " 0x%08lX", static_cast<unsigned long>(static_cast<unsigned>(e.GetCode())));
    return ToUtf8(e.GetExceptionName()) + code;
  } catch (const std::bad_alloc&) {
    return "memory is out";
  } catch (const std::exception& e) {
    return e.what();
  }
}

void FailAt(const std::string& place) {
  try {
    throw;
  } catch (const Failure& failure) {
    if (!failure.place.empty()) throw;
    throw Failure{failure.text, failure.code, place};
  } catch (...) {
    throw Failure{ReasonOfCurrentException(), kFailed, place};
  }
}
