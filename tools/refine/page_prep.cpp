// Surveys the page (bed strips along the edges, the lid's level and drift,
// the noise) and makes the prepared copy the module is run on.
#include "refine/page_prep.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <vector>

#include "refine/lid_level.h"

namespace Refine {
namespace {

constexpr std::array<const char*, 4> kEdgeNames = {"top", "right", "bottom", "left"};

double Percentile(std::vector<double> v, double p) {
  if (v.empty()) return 0.0;
  const auto k = static_cast<size_t>(std::clamp(p, 0.0, 1.0) * static_cast<double>(v.size() - 1));
  std::nth_element(v.begin(), v.begin() + static_cast<std::ptrdiff_t>(k), v.end());
  return v[k];
}

// The median gray of the line at distance d from one page edge, and the share
// of its samples darker than a limit.
struct EdgeLine {
  double median = 0.0;
  std::vector<double> samples;
};

EdgeLine SampleEdgeLine(const GraySampler& g, int edge, int d) {
  const bool horizontal = edge == 0 || edge == 2;
  const int along = horizontal ? g.Width() : g.Height();
  const int n = std::min(along, 256);
  EdgeLine line;
  line.samples.reserve(static_cast<size_t>(n));
  for (int i = 0; i < n; ++i) {
    const int a = static_cast<int>((0.03 + 0.94 * (i + 0.5) / n) * along);
    int x = 0, y = 0;
    if (edge == 0) {
      x = a;
      y = d;
    }
    if (edge == 1) {
      x = g.Width() - 1 - d;
      y = a;
    }
    if (edge == 2) {
      x = a;
      y = g.Height() - 1 - d;
    }
    if (edge == 3) {
      x = d;
      y = a;
    }
    line.samples.push_back(g.Pixel(x, y));
  }
  line.median = Percentile(line.samples, 0.5);
  return line;
}

// A dark strip of the scanner bed along one edge: px to leave out, or 0.
int FindBedStrip(const GraySampler& g, int edge, double lid) {
  const int across = (edge == 0 || edge == 2) ? g.Height() : g.Width();
  const int depth = std::min(across / 5, 400);
  if (depth < 16) return 0;
  const double dark = std::min(0.55 * lid, lid - 60.0);
  // Most pages have no strip: the outermost line tells at once.
  std::vector<double> median;
  auto lineMedian = [&](int d) {
    while (static_cast<int>(median.size()) <= d)
      median.push_back(SampleEdgeLine(g, edge, static_cast<int>(median.size())).median);
    return median[static_cast<size_t>(d)];
  };
  if (lineMedian(0) >= dark) return 0;
  const double bed = std::min({lineMedian(0), lineMedian(1), lineMedian(2)});
  const double half = 0.5 * (bed + lid);
  int w = 0;
  while (w < depth && lineMedian(w) < half) ++w;
  if (w < 2 || w + 12 > depth) return 0;
  // The strip runs the whole edge: nearly every sample of its middle line is dark.
  const EdgeLine middle = SampleEdgeLine(g, edge, w / 2);
  const auto darkCount = std::count_if(middle.samples.begin(), middle.samples.end(),
                                       [dark](double v) { return v < dark; });
  if (static_cast<double>(darkCount) < 0.8 * static_cast<double>(middle.samples.size())) return 0;
  // And the lid follows it.
  for (int d = w + 3; d < w + 12; ++d)
    if (lineMedian(d) < dark) return 0;
  return w + 4;  // past the strip's soft edge
}

void BoxSmooth(std::vector<uint8_t>& pixels, int width, int height, int channels, int box) {
  const int r = box / 2;
  std::vector<int> line(static_cast<size_t>(std::max(width, height)));
  auto pass = [&](int count, int length, auto at) {
    for (int i = 0; i < count; ++i) {
      for (int c = 0; c < channels; ++c) {
        for (int j = 0; j < length; ++j) line[static_cast<size_t>(j)] = *at(i, j, c);
        int sum = 0;
        for (int j = -r - 1; j < r; ++j)
          sum += line[static_cast<size_t>(std::clamp(j, 0, length - 1))];
        for (int j = 0; j < length; ++j) {
          sum += line[static_cast<size_t>(std::min(j + r, length - 1))] -
                 line[static_cast<size_t>(std::max(j - r - 1, 0))];
          *at(i, j, c) = static_cast<uint8_t>((sum + box / 2) / box);
        }
      }
    }
  };
  const auto stride = static_cast<size_t>(width) * static_cast<size_t>(channels);
  pass(height, width, [&](int y, int x, int c) {
    return &pixels[static_cast<size_t>(y) * stride +
                   static_cast<size_t>(x) * static_cast<size_t>(channels) + static_cast<size_t>(c)];
  });
  pass(width, height, [&](int x, int y, int c) {
    return &pixels[static_cast<size_t>(y) * stride +
                   static_cast<size_t>(x) * static_cast<size_t>(channels) + static_cast<size_t>(c)];
  });
}

std::string Describe(const char* kind, double a, double b) {
  char text[160];
  if (kind[0] == 's') {
    std::snprintf(text, sizeof text, "noise of %.1f gray levels smoothed with a %.0f px box", a, b);
  } else if (kind[0] == 'l') {
    std::snprintf(text, sizeof text, "lid levelled to white (was %.0f gray, drifting by %.0f)", a,
                  b);
  } else {
    std::snprintf(text, sizeof text, "%.0f px left out of the filter rectangle", a);
  }
  return text;
}

}  // namespace

PageSurvey SurveyPage(const PageImage& page) {
  PageSurvey survey;
  if (!CheckPageImage(page).empty() || page.width < 64 || page.height < 64) return survey;
  const GraySampler g(page);
  const LidEstimate lid = EstimateLid(page);
  survey.lidLevel = lid.level;
  survey.lidSpread = lid.spread;
  survey.noise = lid.noise;
  survey.lid = lid;
  for (int edge = 0; edge < 4; ++edge)
    survey.bedStrip[static_cast<size_t>(edge)] = FindBedStrip(g, edge, lid.level);
  return survey;
}

PreparedPage PreparePage(const PageImage& page, const PrepareOptions& options) {
  PreparedPage out;
  out.view = page;
  out.survey = SurveyPage(page);
  const PageSurvey& s = out.survey;
  if (s.lidLevel <= 0.0) return out;

  if (options.bedStrips) {
    FilterRect rect{s.bedStrip[0], s.bedStrip[3], page.height - s.bedStrip[2],
                    page.width - s.bedStrip[1]};
    if (rect != FilterRect{0, 0, page.height, page.width} && rect[2] - rect[0] >= 64 &&
        rect[3] - rect[1] >= 64) {
      out.filterRect = rect;
      for (size_t edge = 0; edge < 4; ++edge) {
        if (s.bedStrip[edge] == 0) continue;
        out.steps.push_back({"bed-strip", std::string("dark strip of the scanner bed along the ") +
                                              kEdgeNames[edge] +
                                              " edge: " + Describe("bed", s.bedStrip[edge], 0.0)});
      }
    }
  }

  // The module's edge test sees the channel sum: on RGB pages noise counts
  // three times against its limit.
  const double effectiveNoise = s.noise * (page.channels == 3 ? 3.0 : 1.0);
  const bool smooth = options.smoothNoise && effectiveNoise > 10.0;
  const bool level = options.levelLid && NeedsLevelling(s.lidLevel, s.lidSpread);
  if (!smooth && !level) return out;

  // A tight copy of the page for the module.
  out.pixels.resize(static_cast<size_t>(page.width) * static_cast<size_t>(page.height) *
                    static_cast<size_t>(page.channels));
  for (int y = 0; y < page.height; ++y) {
    const uint8_t* src = page.pixels + static_cast<std::ptrdiff_t>(y) * page.rowBytes;
    uint8_t* dst = out.pixels.data() + static_cast<size_t>(y) * static_cast<size_t>(page.width) *
                                           static_cast<size_t>(page.channels);
    for (int x = 0; x < page.width; ++x)
      for (int c = 0; c < page.channels; ++c)
        dst[x * page.channels + c] = src[x * page.pixelBytes + c];
  }
  out.view = PageImage{page.width,        page.height,
                       page.channels,     page.channels,
                       out.pixels.data(), static_cast<std::ptrdiff_t>(page.width) * page.channels};
  if (level) {
    LevelLid(out.pixels, page.width, page.height, page.channels);
    out.steps.push_back({"level-lid", Describe("level", s.lidLevel, s.lidSpread)});
  }
  if (smooth) {
    const int box = std::clamp(static_cast<int>(std::ceil(effectiveNoise / 8.0)) | 1, 3, 7);
    BoxSmooth(out.pixels, page.width, page.height, page.channels, box);
    out.steps.push_back({"smooth-noise", Describe("smooth", s.noise, box)});
  }
  return out;
}

}  // namespace Refine
