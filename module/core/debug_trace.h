// The debug trace: one line per event in the trace file. Lines from threads
// other than the main thread travel to it as a CDebugEvent.
#pragma once

#include <string>

#include "core/event.h"

namespace Vireo {

// Where the trace goes, before the platform places it.
inline constexpr const char* kDebugTracePath = "/tmp/DebugLog.txt";

// Appends "message,file,line" to the trace file (the first line of the
// process replaces the file); with throwError set it then raises CDebugError.
void DebugTrace(const char* message, const char* file, int line, bool throwError);

class CDebugEvent : public CEvent {
 public:
  static constexpr int32_t kCode = 50;
  CDebugEvent(std::string message, std::string file, int line, bool throwError)
      : CEvent(kCode),
        message_(std::move(message)),
        file_(std::move(file)),
        line_(line),
        throwError_(throwError) {}
  void Run() override;

 private:
  std::string message_;
  std::string file_;
  int line_;
  bool throwError_;
};

}  // namespace Vireo
