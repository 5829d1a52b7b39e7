// An event posted to the framework's process object from any thread and run
// on the main thread when the process object handles its pending events.
#pragma once

#include <cstdint>

namespace Vireo {

class CEvent {
 public:
  explicit CEvent(int32_t code) : code_(code) {}
  CEvent(const CEvent&) = delete;
  CEvent& operator=(const CEvent&) = delete;
  virtual ~CEvent() = default;

  int32_t Code() const { return code_; }
  // Does the event's work on the main thread.
  virtual void Run() = 0;

 private:
  int32_t code_;
};

}  // namespace Vireo
