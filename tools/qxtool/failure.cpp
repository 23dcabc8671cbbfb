#include "tools/qxtool/failure.h"

#include <cstdio>
#include <exception>
#include <new>

#include "qxcore/core/exception.h"
#include "qxcore/core/io_exceptions.h"
#include "tools/qxtool/utf8.h"

void Complain(std::string_view text) {
  std::string line = "qxtool: ";
  // Names come from outside; control characters in them could steer the screen.
  for (char c : text) line += c == '\n' || c == '\r' ? ' ' : (c >= 0 && c < ' ') || c == '\x7F' ? '?' : c;
  line += '\n';
  std::fwrite(line.data(), 1, line.size(), stderr);
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
    std::string text = ToUtf8(e.GetText());
    while (!text.empty() && (text.back() == '\n' || text.back() == '\r' || text.back() == ' ')) text.pop_back();
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
