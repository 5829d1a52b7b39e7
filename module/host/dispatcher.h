// The selector dispatcher: creates, drives and destroys the one filter object
// of a run, and makes sure no exception leaves the module.
#pragma once

#include <cstdint>

namespace Vireo {

enum Selector : int16_t {
  kSelectorAbout = 0,
  kSelectorParameters = 1,
  kSelectorPrepare = 2,
  kSelectorStart = 3,
  kSelectorContinue = 4,
  kSelectorFinish = 5,
};

// Serves one selector; always stores the result word when there is one.
void RunFilterSelector(int16_t selector, void* record, intptr_t* dataSlot, int16_t* result,
                       int32_t filterIndex);

}  // namespace Vireo
