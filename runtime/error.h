// Run-time errors of the component. Inside the library every failure that the original runtime
// would have raised is a VbError exception; the handler template, the trapping helpers and the
// dispatch layer are the only places that catch them and turn them into results.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>

namespace xal {

// The run-time error numbers the component raises or traps.
enum ErrNo : int32_t {
  kErrInvalidCall = 5,         // invalid procedure call or argument
  kErrOverflow = 6,
  kErrOutOfMemory = 7,
  kErrSubscript = 9,           // subscript out of range
  kErrDivByZero = 11,
  kErrTypeMismatch = 13,
  kErrInternal = 51,
  kErrObjectNotSet = 91,
  kErrBadPattern = 93,         // invalid pattern string (Like)
  kErrInvalidNull = 94,
  kErrObjectRequired = 424,
  kErrCannotCreate = 429,      // the class cannot be created (not creatable, no factory)
  kErrNoMember = 438,
  kErrAutomation = 440,        // a host failure that is not a run-time error
  kErrNotOptional = 449,
  kErrWrongArgCount = 450,
  kErrDuplicateKey = 457,
};

// The English description the original runtime gives for an error number; numbers it does not
// know get "Application-defined or object-defined error".
const char* ErrorDescription(int32_t number);

class VbError : public std::runtime_error {
 public:
  explicit VbError(int32_t number) : VbError(number, ErrorDescription(number)) {}
  VbError(int32_t number, std::string description)
      : std::runtime_error(description), number_(number), description_(std::move(description)) {}

  int32_t number() const { return number_; }
  const std::string& description() const { return description_; }

 private:
  int32_t number_;
  std::string description_;
};

[[noreturn]] inline void Raise(int32_t number) { throw VbError(number); }
[[noreturn]] inline void Raise(int32_t number, std::string description) {
  throw VbError(number, std::move(description));
}

}  // namespace xal
