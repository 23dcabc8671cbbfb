#include "qxcore/core/error_cause.h"

SErrorCause::~SErrorCause() = default;

int SGetErrorCause(const SException& exception) noexcept {
  const auto* cause = dynamic_cast<const SErrorCause*>(&exception);
  return cause != nullptr ? cause->GetError() : 0;
}
