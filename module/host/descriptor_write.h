// One write pass of the scripting descriptor that the host collects after the
// run: open a write token, let a callback put the keys, close it into the
// descriptor parameter block.
#pragma once

#include <cstdint>

#include "host/filter_record.h"

namespace Vireo {

// Puts the keys; reports through error how the last put went and answers
// whether it succeeded.
using PutDescriptorKeys = bool (*)(DescriptorParameters* parameters, void* token, int16_t& error);

// Answers true when the keys were put and the descriptor closed without error.
// error: 0 when there is nothing to write to, -108 when the host gives no
// token, else the result of closing. A descriptor handle already in the block
// is disposed of before the new one takes its place.
bool WriteDescriptor(const HandleProcTable* handleProcs, DescriptorParameters* parameters,
                     PutDescriptorKeys putKeys, int16_t& error);

}  // namespace Vireo
