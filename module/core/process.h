// CProcess: the framework's process object. During a filter run it is the
// filter object itself. It owns the queue of events posted from other threads
// and answers the framework's questions that need the host (translation of
// key strings, the owner window of alerts).
#pragma once

#include <memory>
#include <mutex>
#include <vector>

#include "core/messenger.h"
#include "core/text.h"
#include "platform/platform.h"

namespace Vireo {

class CProcess : public CExecutable {
 public:
  CProcess();
  ~CProcess() override;

  // The live process object, or null.
  static CProcess* Current();

  // Queues an event; safe from any thread.
  void PostEvent(std::unique_ptr<CEvent> event);
  // Runs the queued events on the calling (main) thread.
  void HandlePendingEvents();

  // Sets the text to the host's translation of a key string; false when the
  // host offers none.
  virtual bool TranslateKeyString(CText& text);
  // The window that owns the framework's alerts, or null.
  virtual Platform::WindowHandle AlertOwnerWindow();

 private:
  std::mutex queueLock_;
  std::vector<std::unique_ptr<CEvent>> queue_;
};

}  // namespace Vireo
