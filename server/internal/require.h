// Access to the host objects the server module is handed: the original runtime raised error 91
// when a routine used an object variable that was Nothing, and the module's error trapping relies
// on that error rather than on a crash.
#pragma once

#include "runtime/error.h"
#include "runtime/object.h"

namespace xal::server::internal {

// The object behind `p`, or error 91 when it is Nothing.
template <class T>
T& Require(const Ref<T>& p) {
  if (!p) Raise(kErrObjectNotSet);
  return *p;
}

}  // namespace xal::server::internal
