// The module's filter factory: one filter class, at index 0.
#include "host/create_filter.h"

#include "filter/fringe.h"

namespace Vireo {

CRastrixFilter* CreateFilter(int32_t filterIndex) {
  if (filterIndex != 0) return nullptr;
  return new Project::CFringe();
}

}  // namespace Vireo
