// The factory of filter objects; the filter layer defines it.
#pragma once

#include <cstdint>

namespace Vireo {

class CRastrixFilter;

// Index 0 gives a new object of the module's filter class; any other, null.
CRastrixFilter* CreateFilter(int32_t filterIndex);

}  // namespace Vireo
