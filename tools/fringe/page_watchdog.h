// The page time limit for a page processed in the tool's own process: a
// watchdog thread that, when the page overruns, runs the given action (which
// reports the page and ends the process) unless the page finished first.
#pragma once

#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

namespace Fringe {

class PageWatchdog {
 public:
  // seconds: the limit (0: none). onTimeout runs on the watchdog's thread and
  // is expected not to return; Disarm blocks behind it if it does start.
  PageWatchdog(int seconds, std::function<void()> onTimeout);
  ~PageWatchdog();
  PageWatchdog(const PageWatchdog&) = delete;
  PageWatchdog& operator=(const PageWatchdog&) = delete;

  // The page has finished: the action will not run.
  void Disarm();

 private:
  std::mutex mutex_;
  std::condition_variable wake_;
  bool disarmed_ = false;
  std::thread thread_;
};

}  // namespace Fringe
