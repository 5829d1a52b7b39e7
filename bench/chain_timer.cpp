// Times the whole analysis chain on the benchmark pages with a plain clock:
// the best of a number of runs, each on the frame as delivered, beside a
// loop that reads the frame once. Built for every platform, so that the
// Windows build under Wine and the native build can be set side by side.
//
//   fringe_chain_timer [runs]
#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include "bench_pages.h"
#include "filter/analysis/driver.h"

namespace {

class QuietHost : public Project::AnalysisHost {
 public:
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t, int32_t) override {}
  void SetResultCode(int16_t) override {}
  void WriteFringeRecord(const Project::CornerQuad&, int16_t) override {}
  void WriteEmptyFringeRecord() override {}
};

double Seconds(std::chrono::steady_clock::duration d) {
  return std::chrono::duration<double>(d).count();
}

}  // namespace

int main(int argc, char** argv) {
  const int runs = argc > 1 ? std::max(1, std::atoi(argv[1])) : 30;
  std::printf("%-16s %12s %12s %8s\n", "page", "chain ms", "floor ms", "ratio");
  for (auto& page : Bench::Pages()) {
    QuietHost host;
    double bestChain = 1e30;
    double bestFloor = 1e30;
    volatile uint64_t sink = 0;
    for (int run = 0; run < runs; ++run) {
      page->RestoreInput();
      const auto start = std::chrono::steady_clock::now();
      Project::AnalysisResult result;
      Project::RunAnalysis(page->view, host, result);
      bestChain = std::min(bestChain, Seconds(std::chrono::steady_clock::now() - start));
      sink = sink + static_cast<uint64_t>(result.confidence);

      const auto floorStart = std::chrono::steady_clock::now();
      uint64_t sum = 0;
      for (const uint8_t byte : page->output) sum += byte;
      bestFloor = std::min(bestFloor, Seconds(std::chrono::steady_clock::now() - floorStart));
      sink = sink + sum;
    }
    std::printf("%-16s %12.3f %12.3f %8.2f\n", page->name.c_str(), bestChain * 1e3, bestFloor * 1e3,
                bestChain / bestFloor);
  }
  return 0;
}
