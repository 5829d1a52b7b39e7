// Drawing batch progress.
#include "progress.h"

#include <cmath>

namespace Fringe {

namespace {

const char* StatusWord(const PageResult& r) {
  switch (r.status) {
    case PageStatus::Found:
      return "photo found";
    case PageStatus::NotFound:
      return "no photo";
    case PageStatus::Error:
      return "error";
  }
  return "error";
}

}  // namespace

std::string FormatDuration(double seconds) {
  const long s = std::lround(std::max(0.0, seconds));
  char buf[32];
  if (s >= 3600) {
    std::snprintf(buf, sizeof buf, "%ld:%02ld:%02ld", s / 3600, s / 60 % 60, s % 60);
  } else {
    std::snprintf(buf, sizeof buf, "%ld:%02ld", s / 60, s % 60);
  }
  return buf;
}

Progress::Progress(std::FILE* out, bool enabled, bool terminal, size_t total)
    : out_(out),
      enabled_(enabled),
      terminal_(terminal),
      total_(total),
      start_(std::chrono::steady_clock::now()),
      lastDraw_(start_) {
  if (enabled_ && terminal_ && total_ > 0) DrawBar();
}

void Progress::ClearBar() {
  if (barShown_) {
    std::fputs("\r\033[K", out_);
    barShown_ = false;
  }
}

void Progress::DrawBar() {
  const double elapsed =
      std::chrono::duration<double>(std::chrono::steady_clock::now() - start_).count();
  const double rate = elapsed > 0 ? done_ / elapsed : 0.0;
  constexpr int kWidth = 30;
  const int filled = total_ == 0 ? kWidth : static_cast<int>(kWidth * done_ / total_);
  std::string bar(static_cast<size_t>(filled), '#');
  bar.resize(kWidth, '.');
  std::string left = "--:--";
  if (rate > 0) left = FormatDuration((total_ - done_) / rate);
  std::fprintf(out_, "\r\033[K[%s] %zu/%zu  %.1f pages/s  %s left", bar.c_str(), done_, total_,
               rate, left.c_str());
  std::fflush(out_);
  barShown_ = true;
  lastDraw_ = std::chrono::steady_clock::now();
}

void Progress::PageDone(const PageResult& result) {
  ++done_;
  if (!enabled_) return;
  if (terminal_) {
    // Redraw at most ten times a second, and always for the last page.
    if (done_ == total_ ||
        std::chrono::steady_clock::now() - lastDraw_ > std::chrono::milliseconds(100)) {
      DrawBar();
    }
  } else {
    std::fprintf(out_, "fringe: [%zu/%zu] %s: %s\n", done_, total_, result.file.c_str(),
                 StatusWord(result));
    std::fflush(out_);
  }
}

void Progress::Error(const std::string& line) {
  ClearBar();
  std::fprintf(out_, "fringe: %s\n", line.c_str());
  if (enabled_ && terminal_ && done_ < total_) DrawBar();
  std::fflush(out_);
}

void Progress::Warning(const std::string& line) {
  ClearBar();
  std::fprintf(out_, "fringe: warning: %s\n", line.c_str());
  std::fflush(out_);
}

void Progress::Summary(const BatchCounts& c) {
  if (!enabled_) return;
  ClearBar();
  const double elapsed =
      std::chrono::duration<double>(std::chrono::steady_clock::now() - start_).count();
  std::fprintf(out_,
               "fringe: %zu pages in %s (%.1f pages/s): %zu photos found, %zu without photo, "
               "%zu errors",
               done_, FormatDuration(elapsed).c_str(), elapsed > 0 ? done_ / elapsed : 0.0, c.found,
               c.notFound, c.errors);
  if (c.resumed > 0) std::fprintf(out_, "; %zu done earlier", c.resumed);
  std::fputs("\n", out_);
  std::fflush(out_);
}

}  // namespace Fringe
