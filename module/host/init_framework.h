// The framework's start-up before every creation of the filter object.
#pragma once

namespace Vireo {

// Display-scaling awareness on newer systems, the common controls, and the
// calling thread recorded as the framework's main thread.
void InitFramework();

}  // namespace Vireo
