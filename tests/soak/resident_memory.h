// The process's resident memory, for watching a long run stay flat.
#pragma once

#include <cstdint>

namespace Soak {

// Resident bytes of this process (the working set on Windows); 0 when the
// system does not say.
uint64_t ResidentBytes();

}  // namespace Soak
