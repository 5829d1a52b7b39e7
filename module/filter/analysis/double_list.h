// The counted list of doubles shared by the stages. The list owns its
// storage, so a list released on no path is still released when it goes out
// of scope; AllocList and FreeList keep their documented effects.
#pragma once

#include <cstdint>
#include <memory>

namespace Project {

struct DoubleList {
  int32_t count = 0;
  std::unique_ptr<double[]> data;  // null when the list has no storage
};

// Sets the count first. For a count above 0 allocates that many doubles,
// cleared to 0.0 so that a stage stopped half-way never leaves garbage, and
// answers whether that worked; otherwise leaves no storage and answers false.
bool AllocList(DoubleList& list, int32_t count);

// Sets the count to 0; releases the storage and answers true when there was
// some, answers false otherwise.
bool FreeList(DoubleList& list);

}  // namespace Project
