// Generating the benchmark pages and their edge points.
#include "bench_pages.h"

#include <algorithm>
#include <memory>

#include "filter/analysis/edge_map.h"
#include "filter/analysis/edge_points.h"
#include "filter/analysis/records.h"

namespace Bench {
namespace {

// A host that never cancels and ignores progress and records.
class QuietHost : public Project::AnalysisHost {
 public:
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t, int32_t) override {}
  void SetResultCode(int16_t) override {}
  void WriteFringeRecord(const Project::CornerQuad&, int16_t) override {}
  void WriteEmptyFringeRecord() override {}
};

std::unique_ptr<BenchPage> MakePage(const std::string& name, int width, int height, bool color,
                                    double angle) {
  auto bench = std::make_unique<BenchPage>();
  bench->name = name;
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.color = color;
  recipe.photo =
      Synth::PhotoRecipe{width * 0.52, height * 0.47, width * 0.45, height * 0.38, angle};
  bench->page = Synth::GeneratePage(recipe);
  bench->input = bench->page.pixels;
  bench->output = bench->page.pixels;

  Project::FrameView& v = bench->view;
  v.imageMode = color ? 3 : 1;
  v.filterCase = 1;
  v.planes = static_cast<int16_t>(bench->page.channels);
  v.documentRows = static_cast<int16_t>(height);
  v.documentColumns = static_cast<int16_t>(width);
  v.inRect = {0, 0, static_cast<int16_t>(height), static_cast<int16_t>(width)};
  v.outRect = v.inRect;
  v.inData = bench->input.data();
  v.outData = bench->output.data();
  v.inRowBytes = v.outRowBytes = width * bench->page.channels;
  v.inColumnBytes = v.outColumnBytes = bench->page.channels;

  QuietHost host;
  Project::ProgressCounter progress;
  Project::BuildEdgeMap(v, host, 60, progress);
  const Project::Rect search{9, 9, static_cast<int16_t>(height - 9),
                             static_cast<int16_t>(width - 9)};
  Project::FindEdgePoints(v, host, search, bench->xs, bench->ys, progress);
  bench->RestoreInput();
  return bench;
}

}  // namespace

void BenchPage::RestoreInput() {
  std::copy(output.begin(), output.end(), input.begin());
}

std::vector<std::unique_ptr<BenchPage>>& Pages() {
  // Built on first use and kept for the life of the process.
  static std::vector<std::unique_ptr<BenchPage>> pages = [] {
    std::vector<std::unique_ptr<BenchPage>> made;
    made.push_back(MakePage("rgb_2000x1500", 2000, 1500, true, 12.0));
    made.push_back(MakePage("gray_2550x3500", 2550, 3500, false, -7.5));
    return made;
  }();
  return pages;
}

}  // namespace Bench
