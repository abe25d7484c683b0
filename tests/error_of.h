// The error number a call raises, or 0 when it returns normally: the one check every table of bad
// input in these suites makes.
#pragma once

#include <functional>

#include "runtime/error.h"

namespace xal::test {

inline int ErrorOf(const std::function<void()>& call) {
  try {
    call();
  } catch (const VbError& e) {
    return e.number();
  }
  return 0;
}

}  // namespace xal::test
