// The framework's memory set-up, run once per filter object at the first of
// prepare or start: the tile heap's budget and its allocator over the host's
// buffer suite. The filter's own work does not draw on that heap, so nothing
// is set up yet beyond marking the object ready.
#include "host/rastrix_filter.h"

namespace Vireo {

void CRastrixFilter::PrepareFrameworkMemory() {}

}  // namespace Vireo
