// Text output for people.
#include "report_text.h"

#include <charconv>
#include <cstdio>

namespace Fringe {

std::string ExactNumber(double value) {
  char buf[64];
  const auto end = std::to_chars(buf, buf + sizeof buf, value).ptr;
  return std::string(buf, end);
}

namespace {

std::string Tenths(double v) {
  char buf[32];
  std::snprintf(buf, sizeof buf, "%.1f", v);
  return buf;
}

std::string ModulePart(const ModuleAnswer& a) {
  std::string text;
  for (const Corner& c : a.corners)
    text += " (" + std::to_string(c.x) + "," + std::to_string(c.y) + ")";
  return text + ", angle " + ExactNumber(a.angle) + " deg, confidence " +
         std::to_string(a.confidence);
}

std::string Points(const std::array<OutlinePoint, 4>& points) {
  std::string text;
  for (const OutlinePoint& p : points) text += " (" + Tenths(p.x) + "," + Tenths(p.y) + ")";
  return text;
}

}  // namespace

std::string TextLine(const PageResult& r) {
  if (r.status == PageStatus::Error) return "";
  std::string line;
  if (!r.refined.present) {
    if (r.status == PageStatus::NotFound) return r.file + ": no photo found";
    line = r.file + ": photo at" + ModulePart(r.answer);
  } else {
    if (r.status == PageStatus::NotFound) {
      line = r.file + ": no photo found";
      if (r.answer.found) line += " (the module reported one: " + r.refined.reason + ")";
    } else {
      line = r.file + ": photo at" + Points(r.refined.outline) + ", angle " +
             ExactNumber(r.refined.angle) + " deg, " + r.refined.status;
      line += "\n  module:" + (r.answer.found ? ModulePart(r.answer) : std::string(" no photo"));
      if (r.refined.margin)
        line += "\n  picture inside a white margin:" + Points(r.refined.picture);
    }
    for (const PagePreparation& p : r.refined.preparations) line += "\n  prepared: " + p.detail;
  }
  if (!r.outlinePath.empty()) line += "\n  outline: " + r.outlinePath;
  if (!r.photoPath.empty()) line += "\n  photo:   " + r.photoPath;
  return line;
}

}  // namespace Fringe
