// CSystemError, a failure of the operating system with its error number, and
// CDebugError, raised by the debug trace with the place it came from.
#pragma once

#include <cstdint>
#include <string>

#include "core/exception.h"

namespace Vireo {

// The system's number for "out of memory", used for failed allocations.
inline constexpr uint32_t kSystemOutOfMemory = 14;

class CSystemError : public CException {
 public:
  explicit CSystemError(uint32_t number = 0) : number_(number) {}
  uint32_t Number() const { return number_; }
  void DescribeReason(CText& reason) const override;

 private:
  uint32_t number_;
};

class CDebugError : public CException {
 public:
  CDebugError(std::string message, std::string file, int line)
      : message_(std::move(message)), file_(std::move(file)), line_(line) {}
  void DescribeTask(CText& task) const override;
  void DescribeReason(CText& reason) const override;

 private:
  std::string message_;
  std::string file_;
  int line_;
};

}  // namespace Vireo
