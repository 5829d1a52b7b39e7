// The list of live framework services.
#include "core/service.h"

namespace Vireo {
namespace {
CService* g_liveHead = nullptr;
}

void CService::LinkLive() {
  if (linked_) return;
  next_ = g_liveHead;
  g_liveHead = this;
  linked_ = true;
}

void ReleaseServices() {
  while (CService* head = g_liveHead) {
    g_liveHead = head->next_;
    head->next_ = nullptr;
    head->linked_ = false;
    head->ReleaseInstance();
  }
}

bool NoLiveServices() {
  return g_liveHead == nullptr;
}

}  // namespace Vireo
