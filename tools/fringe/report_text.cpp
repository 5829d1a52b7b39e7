// Text output for people.
#include "report_text.h"

#include <charconv>

namespace Fringe {

std::string ExactNumber(double value) {
  char buf[64];
  const auto end = std::to_chars(buf, buf + sizeof buf, value).ptr;
  return std::string(buf, end);
}

std::string TextLine(const PageResult& r) {
  if (r.status == PageStatus::Error) return "";
  if (r.status == PageStatus::NotFound) return r.file + ": no photo found";
  std::string line = r.file + ": photo at";
  for (const Corner& c : r.answer.corners) {
    line += " (" + std::to_string(c.x) + "," + std::to_string(c.y) + ")";
  }
  line += ", angle " + ExactNumber(r.answer.angle) + " deg, confidence " +
          std::to_string(r.answer.confidence);
  if (!r.outlinePath.empty()) line += "\n  outline: " + r.outlinePath;
  if (!r.photoPath.empty()) line += "\n  photo:   " + r.photoPath;
  return line;
}

}  // namespace Fringe
