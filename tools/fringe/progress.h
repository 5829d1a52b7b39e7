// Progress of a batch on standard error: a bar redrawn in place when it is a
// terminal (done, rate, time left), one plain line per page otherwise, and a
// summary at the end.
#pragma once

#include <chrono>
#include <cstdio>
#include <string>

#include "page_result.h"

namespace Fringe {

struct BatchCounts {
  size_t found = 0;
  size_t notFound = 0;
  size_t errors = 0;
  size_t resumed = 0;  // recorded by an earlier run and not processed again
};

class Progress {
 public:
  // enabled false: nothing but error lines is printed.
  Progress(std::FILE* out, bool enabled, bool terminal, size_t total);

  void PageDone(const PageResult& result);
  // Error lines go through here so that they do not tear the bar.
  void Error(const std::string& line);
  void Warning(const std::string& line);
  void Summary(const BatchCounts& counts);

 private:
  void ClearBar();
  void DrawBar();

  std::FILE* out_;
  bool enabled_;
  bool terminal_;
  size_t total_;
  size_t done_ = 0;
  bool barShown_ = false;
  std::chrono::steady_clock::time_point start_;
  std::chrono::steady_clock::time_point lastDraw_;
};

// "1:05", "12:00:09".
std::string FormatDuration(double seconds);

}  // namespace Fringe
