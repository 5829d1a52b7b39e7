// A host suite as the basic suite hands it out: a plain list of procedure
// pointers, with no version or count in front.
#pragma once

namespace Vireo {

using SuiteProcedures = const void* const*;

// The procedure at `position` (counted from 1) of a suite's list, or null.
template <typename Proc>
Proc SuiteProcedure(SuiteProcedures suite, int position) {
  if (suite == nullptr || position < 1) return nullptr;
  return reinterpret_cast<Proc>(const_cast<void*>(suite[position - 1]));
}

}  // namespace Vireo
