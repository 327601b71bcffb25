// FailureOf: what a call fails with.
#pragma once

#include "platform/runtime_error.h"

namespace tendril::test {

// Number 0 and "none" when `call` does not fail.
template <typename Call>
RuntimeError FailureOf(const Call& call) {
  try {
    call();
    return {0, "none"};
  } catch (const RuntimeError& failure) {
    return failure;
  }
}

}  // namespace tendril::test
