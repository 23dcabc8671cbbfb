// What the file services share: their results, and sizes in two halves.
#pragma once

#include <cstdint>

#include "qxcore/platform/win32.h"

// A status of SFile as the result of a service; S_OK is SFile::kOk.
template <class Status>
HRESULT Result(Status status) {
  return static_cast<HRESULT>(status);
}
template <class Status>
HRESULT Result(bool succeeded, Status failure) {
  return succeeded ? S_OK : Result(failure);
}

inline std::uint64_t Join(unsigned long low, unsigned long high) {
  return static_cast<std::uint64_t>(static_cast<DWORD>(high)) << 32 | static_cast<DWORD>(low);
}
