// Markdown tables of an accuracy run.
#include "accuracy/report.h"

#include <algorithm>
#include <cstdio>
#include <map>

namespace Accuracy {
namespace {

std::string Fixed(double value, int decimals) {
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%.*f", decimals, value);
  return buffer;
}

std::string Rate(int part, int whole) {
  if (whole == 0) return "-";
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%d/%d (%.1f%%)", part, whole, 100.0 * part / whole);
  return buffer;
}

std::string Row(const std::string& label, const std::string& raw, const std::string& refined) {
  return "| " + label + " | " + raw + " | " + refined + " |\n";
}

double MeanOf(const std::vector<double>& v) {
  double s = 0.0;
  for (double x : v) s += x;
  return v.empty() ? 0.0 : s / static_cast<double>(v.size());
}

}  // namespace

std::string SummaryTable(const std::vector<PageOutcome>& outcomes) {
  std::vector<Score> raw, refined;
  std::vector<double> detect, prepare, refine;
  for (const PageOutcome& o : outcomes) {
    raw.push_back(o.raw);
    refined.push_back(o.refined);
    detect.push_back(o.detectMs);
    prepare.push_back(o.prepareMs);
    refine.push_back(o.refineMs);
  }
  const Summary r = Summarise(raw);
  const Summary f = Summarise(refined);
  std::string t;
  t += "| | module alone | refined |\n|---|---:|---:|\n";
  t += Row("photos found (all four corners within 10 px)", Rate(r.found, r.photoPages),
           Rate(f.found, f.photoPages));
  t += Row("corner error, mean (px)", Fixed(r.meanError, 2), Fixed(f.meanError, 2));
  t += Row("corner error, median (px)", Fixed(r.medianError, 2), Fixed(f.medianError, 2));
  t += Row("corner error, 95th percentile (px)", Fixed(r.p95Error, 2), Fixed(f.p95Error, 2));
  t += Row("corner error, max (px)", Fixed(r.maxError, 1), Fixed(f.maxError, 1));
  t += Row("angle error, mean (degrees)", Fixed(r.meanAngleError, 3), Fixed(f.meanAngleError, 3));
  t += Row("angle error, median (degrees)", Fixed(r.medianAngleError, 3),
           Fixed(f.medianAngleError, 3));
  t += Row("angle error, max (degrees)", Fixed(r.maxAngleError, 3), Fixed(f.maxAngleError, 3));
  t += Row("blank pages with no photo reported", Rate(r.blankQuiet, r.blankPages),
           Rate(f.blankQuiet, f.blankPages));
  t += Row("time per page, mean (ms)", "detect " + Fixed(MeanOf(detect), 1),
           "+ prepare " + Fixed(MeanOf(prepare), 1) + " + refine " + Fixed(MeanOf(refine), 1));
  return t;
}

std::string KindTable(const std::vector<PageOutcome>& outcomes) {
  struct Group {
    std::vector<Score> raw, refined;
  };
  std::map<std::string, Group> groups;
  std::vector<std::string> order;
  for (const PageOutcome& o : outcomes) {
    if (!groups.count(o.kind)) order.push_back(o.kind);
    groups[o.kind].raw.push_back(o.raw);
    groups[o.kind].refined.push_back(o.refined);
  }
  std::string t =
      "| kind | pages | found, module | found, refined | median error, module (px) | median error, "
      "refined (px) |\n";
  t += "|---|---:|---:|---:|---:|---:|\n";
  for (const std::string& kind : order) {
    const Summary r = Summarise(groups[kind].raw);
    const Summary f = Summarise(groups[kind].refined);
    const int pages = static_cast<int>(groups[kind].raw.size());
    if (r.photoPages == 0) {
      t += "| " + kind + " | " + std::to_string(pages) + " | " + Rate(r.blankQuiet, r.blankPages) +
           " quiet | " + Rate(f.blankQuiet, f.blankPages) + " quiet | - | - |\n";
      continue;
    }
    t += "| " + kind + " | " + std::to_string(pages) + " | " + Rate(r.found, r.photoPages) + " | " +
         Rate(f.found, f.photoPages) + " | " + Fixed(r.medianError, 2) + " | " +
         Fixed(f.medianError, 2) + " |\n";
  }
  return t;
}

std::string PageLine(const PageOutcome& o) {
  auto mark = [](const Score& s) {
    if (!s.photoPage) return s.falseAlarm ? "false photo" : "no photo";
    return s.found ? "found" : (s.reported ? "off" : "missed");
  };
  std::string line = o.name + "  module: " + mark(o.raw) + " " + Fixed(o.raw.maxCornerError, 2) +
                     " px" + "  refined: " + mark(o.refined) + " " +
                     Fixed(o.refined.maxCornerError, 2) + " px" + "  " + o.status;
  for (const std::string& p : o.preparations) line += " [" + p + "]";
  line += "  " + Fixed(o.detectMs, 0) + " + " + Fixed(o.prepareMs, 0) + " + " +
          Fixed(o.refineMs, 1) + " ms";
  return line;
}

}  // namespace Accuracy
