// libvips error texts, cleaned for one-line messages.
#include "vips_text.h"

#include <sstream>

namespace Fringe {

std::string VipsReason(const vips::VError& error) {
  std::istringstream in(error.what());
  std::string line, reason;
  while (std::getline(in, line)) {
    while (!line.empty() && (line.back() == '\r' || line.back() == ' ')) line.pop_back();
    if (line.empty()) continue;
    if (!reason.empty()) reason += "; ";
    reason += line;
  }
  vips_error_clear();
  return reason.empty() ? "unknown libvips error" : reason;
}

}  // namespace Fringe
