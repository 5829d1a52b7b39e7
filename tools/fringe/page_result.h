// The outcome of one page: what the module answered, what was written, how
// long each stage took, or why the page failed.
#pragma once

#include <array>
#include <cstdint>
#include <string>

#include "page_error.h"
#include "refined_answer.h"

namespace Fringe {

// A corner in the file's stored pixel coordinates: x is the column, y the row.
struct Corner {
  int32_t x = 0;
  int32_t y = 0;
  bool operator==(const Corner&) const = default;
};

// The module's answer for a page, as published in its record and descriptor,
// with the corners scaled back when detection ran on a downscaled copy.
struct ModuleAnswer {
  bool found = false;
  std::array<Corner, 4> corners{};  // top-left, top-right, bottom-right, bottom-left
  double angle = 0.0;               // degrees, as the module published it
  int32_t confidence = 0;
  double detectScale = 1.0;  // size of the detected copy relative to the page
  bool operator==(const ModuleAnswer&) const = default;
};

// The outline that drawing and cropping follow: the module's answer as it
// stands, or a refined one when a step between detection and output supplies it.
struct PhotoOutline {
  std::array<Corner, 4> corners{};  // top-left, top-right, bottom-right, bottom-left
  double angle = 0.0;               // degrees
};

inline PhotoOutline OutlineOf(const ModuleAnswer& answer) {
  return {answer.corners, answer.angle};
}

struct PageTimes {
  double decodeMs = 0.0;
  double detectMs = 0.0;
  double writeMs = 0.0;
};

enum class PageStatus { Found, NotFound, Error };

struct PageResult {
  std::string file;  // the input as the user named it
  PageStatus status = PageStatus::Error;
  ErrorKind errorKind = ErrorKind::Internal;
  std::string error;  // why the page failed; empty otherwise
  int32_t width = 0;
  int32_t height = 0;
  bool gray = false;        // detected as a grayscale document rather than RGB
  bool alpha = false;       // the alpha channel went to the module as transparency
  std::string format;       // the loader that read the file, e.g. "jpeg"
  ModuleAnswer answer;      // exactly as the module published it
  RefinedAnswer refined;    // the outline found again in the page, unless --raw
  std::string outlinePath;  // written outline picture, empty if none
  std::string photoPath;    // written straightened photo, empty if none
  PageTimes times;
};

// The exit code that one page's outcome asks for.
inline int ExitCodeOf(const PageResult& r) {
  switch (r.status) {
    case PageStatus::Found:
      return kExitOk;
    case PageStatus::NotFound:
      return kExitNoPhoto;
    case PageStatus::Error:
      return ExitCodeFor(r.errorKind);
  }
  return kExitInternal;
}

inline PageResult ErrorResult(const std::string& file, ErrorKind kind, const std::string& why) {
  PageResult r;
  r.file = file;
  r.status = PageStatus::Error;
  r.errorKind = kind;
  r.error = why;
  return r;
}

}  // namespace Fringe
