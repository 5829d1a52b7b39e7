// The bottom of the framework's object chain: CMessenger receives events,
// CExecutable is something the framework can open and run. The windowing
// toolkit builds on both; a filter run only constructs and destroys them.
#pragma once

#include "core/event.h"

namespace Vireo {

class CMessenger {
 public:
  CMessenger() = default;
  CMessenger(const CMessenger&) = delete;
  CMessenger& operator=(const CMessenger&) = delete;
  virtual ~CMessenger() = default;

  virtual void HandleEvent(CEvent& event) { event.Run(); }
};

class CExecutable : public virtual CMessenger {
 public:
  CExecutable() = default;
  ~CExecutable() override = default;
};

}  // namespace Vireo
