// A deliberately broken module file for the tool's fault tests. At prepare it
// looks at the document's width: a width ending in 1 aborts the process, a
// width ending in 3 hangs it for good. Every other call goes on to the real
// module named by FRINGE_FORWARD_MODULE (when set; otherwise it answers
// success and publishes nothing), so that healthy pages get real answers.
#include <dlfcn.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace {

using EntryPoint = void (*)(int16_t, void*, intptr_t*, int16_t*);

EntryPoint RealEntry() {
  static EntryPoint entry = [] {
    const char* path = std::getenv("FRINGE_FORWARD_MODULE");
    if (path == nullptr || *path == '\0') return EntryPoint{nullptr};
    void* library = dlopen(path, RTLD_NOW | RTLD_LOCAL);
    return library != nullptr ? reinterpret_cast<EntryPoint>(dlsym(library, "ENTRYPOINT1"))
                              : EntryPoint{nullptr};
  }();
  return entry;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) void ENTRYPOINT1(int16_t selector, void* record,
                                                                   intptr_t* data,
                                                                   int16_t* result) {
  constexpr int kPrepare = 2;
  constexpr size_t kDocumentWidthOffset = 30;  // the document's column count, 16-bit
  if (selector == kPrepare && record != nullptr) {
    int16_t width = 0;
    std::memcpy(&width, static_cast<const char*>(record) + kDocumentWidthOffset, sizeof width);
    if (width % 10 == 1) std::abort();
    if (width % 10 == 3) {
      for (;;) ::pause();
    }
  }
  if (EntryPoint real = RealEntry()) {
    real(selector, record, data, result);
  } else if (result != nullptr) {
    *result = 0;
  }
}
