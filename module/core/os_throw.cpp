// The operating-system error routines.
#include "core/os_throw.h"

#include "core/debug_trace.h"
#include "core/system_error.h"
#include "platform/platform.h"

namespace Vireo {
namespace {

[[noreturn]] void TraceAndThrow(const char* routine, uint32_t number, const char* file, int line) {
  DebugTrace(routine, file, line, false);
  throw CSystemError(number);
}

uint32_t LastErrorOr(uint32_t fallback) {
  const uint32_t last = Platform::LastSystemError();
  return last != 0 ? last : fallback;
}

}  // namespace

void OSThrow(uint32_t number, const char* file, int line) {
  if (number != 0) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrow\".", number, file, line);
  }
}

void OSThrowFalse(bool condition, uint32_t number, const char* file, int line) {
  if (!condition) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowFalse\".", number, file, line);
  }
}

void OSThrowZero(int64_t value, uint32_t number, const char* file, int line) {
  if (value == 0) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowZero\".", number, file, line);
  }
}

void OSThrowNull(const void* pointer, const char* file, int line) {
  if (pointer == nullptr) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowNull\".", kSystemOutOfMemory, file,
                  line);
  }
}

void OSThrowLast(const char* file, int line) {
  if (const uint32_t last = Platform::LastSystemError(); last != 0) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowLast\".", last, file, line);
  }
}

void OSThrowLastFalse(bool condition, const char* file, int line) {
  if (!condition) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowLastFalse\".",
                  Platform::LastSystemError(), file, line);
  }
}

void OSThrowLastZero(int64_t value, const char* file, int line) {
  if (value == 0) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowLastZero\".",
                  Platform::LastSystemError(), file, line);
  }
}

void OSThrowLastNull(const void* pointer, const char* file, int line) {
  if (pointer == nullptr) {
    TraceAndThrow("Exception thrown: \"CSystemError from OSThrowLastNull\".",
                  LastErrorOr(kSystemOutOfMemory), file, line);
  }
}

void OSThrow(uint32_t number) {
  if (number != 0) throw CSystemError(number);
}

void OSThrowFalse(bool condition, uint32_t number) {
  if (!condition) throw CSystemError(number);
}

void OSThrowZero(int64_t value, uint32_t number) {
  if (value == 0) throw CSystemError(number);
}

void OSThrowNull(const void* pointer) {
  if (pointer == nullptr) throw CSystemError(kSystemOutOfMemory);
}

void OSThrowLast() {
  if (const uint32_t last = Platform::LastSystemError(); last != 0) throw CSystemError(last);
}

void OSThrowLastFalse(bool condition) {
  if (!condition) throw CSystemError(Platform::LastSystemError());
}

void OSThrowLastZero(int64_t value) {
  if (value == 0) throw CSystemError(Platform::LastSystemError());
}

void OSThrowLastNull(const void* pointer) {
  if (pointer == nullptr) throw CSystemError(LastErrorOr(kSystemOutOfMemory));
}

}  // namespace Vireo
