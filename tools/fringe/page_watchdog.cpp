// The single-page watchdog.
#include "page_watchdog.h"

#include <chrono>

namespace Fringe {

PageWatchdog::PageWatchdog(int seconds, std::function<void()> onTimeout) {
  if (seconds <= 0) return;
  thread_ = std::thread([this, seconds, action = std::move(onTimeout)] {
    std::unique_lock<std::mutex> lock(mutex_);
    if (wake_.wait_for(lock, std::chrono::seconds(seconds), [this] { return disarmed_; })) return;
    // Still holding the lock: a page finishing now waits in Disarm while the
    // action reports the page as failed.
    action();
  });
}

PageWatchdog::~PageWatchdog() {
  Disarm();
  if (thread_.joinable()) thread_.join();
}

void PageWatchdog::Disarm() {
  {
    std::lock_guard<std::mutex> lock(mutex_);
    disarmed_ = true;
  }
  wake_.notify_all();
}

}  // namespace Fringe
