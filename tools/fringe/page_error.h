// The one exception that carries a page's failure up to where it is reported,
// with the kind of failure that decides the exit code.
#pragma once

#include <stdexcept>
#include <string>

#include "exit_codes.h"

namespace Fringe {

enum class ErrorKind { BadInput, Output, Internal };

inline int ExitCodeFor(ErrorKind kind) {
  switch (kind) {
    case ErrorKind::BadInput:
      return kExitBadInput;
    case ErrorKind::Output:
      return kExitCannotWrite;
    case ErrorKind::Internal:
      return kExitInternal;
  }
  return kExitInternal;
}

inline const char* ErrorKindName(ErrorKind kind) {
  switch (kind) {
    case ErrorKind::BadInput:
      return "bad_input";
    case ErrorKind::Output:
      return "output";
    case ErrorKind::Internal:
      return "internal";
  }
  return "internal";
}

class PageError : public std::runtime_error {
 public:
  PageError(ErrorKind kind, const std::string& what) : std::runtime_error(what), kind_(kind) {}
  ErrorKind Kind() const { return kind_; }

 private:
  ErrorKind kind_;
};

}  // namespace Fringe
