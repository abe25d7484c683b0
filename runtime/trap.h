// Error trapping. The original runtime let a routine say "on error resume next" or "on error go to
// the end"; here the routine runs its steps through these helpers. They are the only places outside
// the dispatch layer and the document handler template that catch run-time errors, so every rule
// of the form "errors are ignored" or "a failing step leaves the start value" reads the same.
//
// A failure of the host that is not a VbError (a C++ exception escaping a host object) is trapped
// too: to the component it is one more run-time error, reported with the number CaughtError gives.
#pragma once

#include <cstdint>
#include <exception>
#include <new>
#include <string>
#include <type_traits>
#include <utility>

#include "runtime/error.h"
#include "runtime/object.h"

namespace xal {

// The number and text of a trapped error.
struct TrappedError {
  int32_t number = 0;
  std::string description;
};

// Describes the exception being handled; call only inside a catch block.
//   1. A VbError keeps its own number and text.
//   2. Memory exhaustion is error 7.
//   3. Any other std::exception is error 440 carrying what() as its text.
//   4. Anything else is error 440 with the runtime's text for it.
inline TrappedError CurrentTrappedError() {
  try {
    throw;
  } catch (const VbError& e) {
    return {e.number(), e.description()};
  } catch (const std::bad_alloc&) {
    return {kErrOutOfMemory, ErrorDescription(kErrOutOfMemory)};
  } catch (const std::exception& e) {
    return {kErrAutomation, e.what()};
  } catch (...) {
    return {kErrAutomation, ErrorDescription(kErrAutomation)};
  }
}

// Runs `step` and swallows any run-time error it raises ("resume at the next statement").
// Returns True when the step finished without an error.
template <class F>
bool TryStep(F&& step) noexcept {
  try {
    std::forward<F>(step)();
    return true;
  } catch (...) {
    return false;
  }
}

// Runs `step` and returns its value, or `fallback` when it raises a run-time error.
template <class F, class T>
auto TryOr(F&& step, T fallback) noexcept -> std::decay_t<decltype(step())> {
  try {
    return std::forward<F>(step)();
  } catch (...) {
    return std::move(fallback);
  }
}

// Runs `step`; on a run-time error hands the trapped error to `onError` (which must not throw) and
// returns False. Used where the error is reported, not only swallowed.
template <class F, class E>
bool TryReport(F&& step, E&& onError) noexcept {
  try {
    std::forward<F>(step)();
    return true;
  } catch (...) {
    TrappedError e = CurrentTrappedError();
    try {
      onError(e);
    } catch (...) {
    }
    return false;
  }
}

// The object behind `p`, or run-time error 91 when it is Nothing: every use of a host reference
// goes through this (or Checked below), so a host that answers Nothing ends the routine with the
// error its trapping expects instead of a crash.
template <class T>
T& Require(const Ref<T>& p) {
  if (!p) Raise(kErrObjectNotSet);
  return *p;
}

// A host reference whose -> raises error 91 when it is Nothing. Owning, like Ref<T>.
template <class T>
class Checked {
 public:
  Checked() = default;
  Checked(Ref<T> p) : p_(std::move(p)) {}  // NOLINT: implicit on purpose, it wraps any Ref
  T* operator->() const { return &Require(p_); }
  T& operator*() const { return Require(p_); }
  const Ref<T>& get() const { return p_; }
  explicit operator bool() const { return static_cast<bool>(p_); }
  void reset() { p_.reset(); }

 private:
  Ref<T> p_;
};

}  // namespace xal
