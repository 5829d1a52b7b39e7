// Conversions from double to integer as the analysis defines them: toward
// zero, and defined for every input.
#pragma once

#include <cmath>
#include <cstdint>

namespace Project {

// Truncates toward zero to 32 bits. A value that does not fit (or NaN) gives
// INT32_MIN, the answer of the processor's own conversion, instead of
// undefined behaviour; every in-range value converts exactly as a cast would.
inline int32_t TruncToInt32(double value) {
  if (!(value > -2147483649.0 && value < 2147483648.0)) return INT32_MIN;
  return static_cast<int32_t>(value);
}

// Half away from zero: floor(a + 0.5) above zero, ceil(a - 0.5) otherwise.
inline double RoundHalfAway(double value) {
  return value > 0.0 ? std::floor(value + 0.5) : std::ceil(value - 0.5);
}

}  // namespace Project
