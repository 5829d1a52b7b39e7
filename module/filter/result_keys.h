// The keys of the result descriptor: 'angl' as a float, then 'conf' and the
// eight corner values 'pt1v' ... 'pt4h' as integers, in that order.
#pragma once

#include <cstdint>

#include "filter/analysis/types.h"
#include "host/filter_record.h"

namespace Project {

// Puts the keys from the given result. Every key is put whatever the earlier
// puts returned; error ends as the last put's result, and the answer is
// whether that was 0.
bool PutResultKeysFrom(const AnalysisResult& result, Vireo::DescriptorParameters* parameters,
                       void* token, int16_t& error);

// The descriptor write pass's callback: the keys of the module's last result.
bool PutResultKeys(Vireo::DescriptorParameters* parameters, void* token, int16_t& error);

}  // namespace Project
