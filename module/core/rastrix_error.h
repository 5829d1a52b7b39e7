// CRastrixError: a failure that the host reported with one of its 16-bit
// result codes. The selector guards hand the code back to the host unshown.
#pragma once

#include <cstdint>

#include "core/exception.h"

namespace Vireo {

// Host result codes the frame raises or meets.
inline constexpr int16_t kUserCanceledErr = -128;
inline constexpr int16_t kMemFullErr = -108;
inline constexpr int16_t kParamErr = -50;

class CRastrixError : public CException {
 public:
  explicit CRastrixError(int16_t code = 0) : code_(code) {}
  int16_t Code() const { return code_; }
  void DescribeReason(CText& reason) const override;

 private:
  int16_t code_;
};

// The key string that explains a host result code.
const char* RastrixErrorMessage(int16_t code);

}  // namespace Vireo
