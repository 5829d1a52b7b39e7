// What the processor the module runs on offers beyond the x86-64 baseline,
// as far as the analysis chooses its row kernels by it. Kept apart from the
// rest of the platform seam because the analysis library, which knows no
// host or system classes, links it alone.
#pragma once

namespace Vireo::Platform {

// True when the processor and the operating system both support AVX2 (the
// system must save the wide registers across thread switches).
bool ProcessorHasAvx2();

}  // namespace Vireo::Platform
