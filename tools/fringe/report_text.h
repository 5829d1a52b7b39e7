// The human-readable line printed for a page on standard output.
#pragma once

#include <string>

#include "page_result.h"

namespace Fringe {

// "scan.jpg: photo at (x,y) ... angle 3.25 deg, confidence 255" and the files
// written; empty for a failed page (its error goes to standard error).
std::string TextLine(const PageResult& result);

// The angle in the shortest text that reads back to the same double.
std::string ExactNumber(double value);

}  // namespace Fringe
