// A module file that fails the way a broken module can: on the prepare
// selector it aborts when the document is an odd number of pixels wide, and
// otherwise it answers every selector with success and publishes nothing.
#include <cstdint>
#include <cstdlib>
#include <cstring>

extern "C" __attribute__((visibility("default"))) void ENTRYPOINT1(int16_t selector, void* record,
                                                                   intptr_t*, int16_t* result) {
  constexpr int kPrepare = 2;
  constexpr size_t kDocumentWidthOffset = 30;  // the document's column count, 16-bit
  if (selector == kPrepare && record != nullptr) {
    int16_t width = 0;
    std::memcpy(&width, static_cast<const char*>(record) + kDocumentWidthOffset, sizeof width);
    if (width % 2 != 0) std::abort();
  }
  if (result != nullptr) *result = 0;
}
