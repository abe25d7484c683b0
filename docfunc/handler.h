// The handler template every DocFunc handler runs through, so that no handler repeats it:
//   1. EnterHandler: one level deeper on the call stack, the rows' position remembered.
//   2. The body, which sets the handler's result through a reference. A run-time error or any
//      other failure of the host ends the body; the result stays as it was last set.
//   3. LeaveHandler: the error (if any) shown in the status line as text 90; the outermost handler
//      performs the deferred refreshes and totals; the rows go back to the remembered position.
//   4. The result is returned (True regardless for the few handlers whose rule says so).
// Nothing escapes: a handler called before Create or after Destroy returns its start value.
#pragma once

#include <type_traits>
#include <utility>

#include "docfunc/docfunc.h"
#include "runtime/trap.h"

namespace xal {

template <class T, class F>
T DocFunc::RunHandler(const char* name, T start, ResultRule rule, F&& body) {
  T result = std::move(start);
  TrappedError error;
  EnterHandler(name);
  try {
    std::forward<F>(body)(result);
  } catch (...) {
    error = CurrentTrappedError();
  }
  LeaveHandler(name, error);
  if constexpr (std::is_same_v<T, bool>)
    if (rule == ResultRule::TrueAfterLeave) result = true;
  return result;
}

template <class F>
bool DocFunc::Handle(const char* name, F&& body) {
  return RunHandler<bool>(name, false, ResultRule::AsLastSet, std::forward<F>(body));
}

template <class F>
bool DocFunc::HandleAlwaysTrue(const char* name, F&& body) {
  return RunHandler<bool>(name, false, ResultRule::TrueAfterLeave, std::forward<F>(body));
}

template <class F>
Variant DocFunc::HandleDefault(const char* name, F&& body) {
  return RunHandler<Variant>(name, Variant(), ResultRule::AsLastSet, std::forward<F>(body));
}

}  // namespace xal
