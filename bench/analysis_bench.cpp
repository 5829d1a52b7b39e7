// Benchmarks of each analysis stage and of the whole chain, in megapixels of
// frame per second, beside two loops that read the frame once: MemoryFloor
// adds every byte into a 64-bit total (the plain loop the targets are set
// against), MemoryBandwidth takes the smallest byte of each run of 64 and so
// runs at the speed the memory delivers. Beside them the chain through the
// literal stages and, where OpenCV is installed, a conventional contour
// detector. The summary at the end gives every figure as a multiple of both
// floors on the same page, and each stage's share of the chain.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <limits>
#include <map>
#include <string>
#include <vector>

#include <unistd.h>

#include "bench_pages.h"
#include "filter/analysis/angle.h"
#include "filter/analysis/box_fit.h"
#include "filter/analysis/classification.h"
#include "filter/analysis/driver.h"
#include "filter/analysis/edge_map.h"
#include "filter/analysis/edge_points.h"
#include "filter/analysis/kernel_choice.h"
#include "filter/analysis/profiles.h"
#include "filter/analysis/reference/literal_stages.h"
#if FRINGE_BENCH_CONTOURS
#include "contour_detector.h"
#endif

namespace {

using Bench::BenchPage;
using namespace Project;

class QuietHost : public AnalysisHost {
 public:
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t, int32_t) override {}
  void SetResultCode(int16_t) override {}
  void WriteFringeRecord(const CornerQuad&, int16_t) override {}
  void WriteEmptyFringeRecord() override {}
};

void CountPixels(benchmark::State& state, const BenchPage& page) {
  state.counters["MP/s"] =
      benchmark::Counter(page.Megapixels() * state.iterations() * 1e6, benchmark::Counter::kIsRate,
                         benchmark::Counter::kIs1000);
}

// The quickest single iteration by the wall clock, as the counter best_ms:
// other work on a shared machine only ever adds time, so beside the mean
// the best run shows the code's own speed.
class BestRun {
 public:
  void Start() { start_ = std::chrono::steady_clock::now(); }
  void Stop() {
    const std::chrono::duration<double, std::milli> took =
        std::chrono::steady_clock::now() - start_;
    best_ = std::min(best_, took.count());
  }
  void Report(benchmark::State& state) const { state.counters["best_ms"] = best_; }

 private:
  std::chrono::steady_clock::time_point start_;
  double best_ = std::numeric_limits<double>::infinity();
};

// Reads every byte of the frame once, as fast as a plain loop can.
void MemoryFloor(benchmark::State& state, BenchPage& page) {
  BestRun best;
  for (auto _ : state) {
    best.Start();
    uint64_t sum = 0;
    const uint8_t* p = page.output.data();
    const size_t n = page.output.size();
    for (size_t i = 0; i < n; ++i) sum += p[i];
    benchmark::DoNotOptimize(sum);
    best.Stop();
  }
  best.Report(state);
  CountPixels(state, page);
}

// Reads every byte once at memory speed: the smallest byte of each run of 64
// (a reduction the compiler turns into vector code), combined into a total.
void MemoryBandwidth(benchmark::State& state, BenchPage& page) {
  for (auto _ : state) {
    uint64_t total = 0;
    const uint8_t* p = page.output.data();
    const size_t n = page.output.size();
    for (size_t start = 0; start < n; start += 64) {
      uint8_t smallest = 255;
      const size_t end = std::min(n, start + 64);
      for (size_t i = start; i < end; ++i) smallest = std::min(smallest, p[i]);
      total += smallest;
    }
    benchmark::DoNotOptimize(total);
  }
  CountPixels(state, page);
}

void Profiles(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  DoubleList columns;
  DoubleList rows;
  AllocList(columns, page.page.width);
  AllocList(rows, page.page.height);
  for (auto _ : state) {
    ProgressCounter progress;
    ComputeProfiles(page.view, host, columns, rows, progress);
    benchmark::DoNotOptimize(rows.data[0]);
  }
  CountPixels(state, page);
}

void Classification(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  DoubleList columns;
  DoubleList rows;
  AllocList(columns, page.page.width);
  AllocList(rows, page.page.height);
  ProgressCounter progress;
  ComputeProfiles(page.view, host, columns, rows, progress);
  for (auto _ : state) {
    benchmark::DoNotOptimize(ProfileCentroid(columns) + ProfileCentroid(rows));
    benchmark::DoNotOptimize(ClassifyPosition(columns, rows, 10.0));
  }
  CountPixels(state, page);
}

void EdgeMap(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  for (auto _ : state) {
    ProgressCounter progress;
    BuildEdgeMap(page.view, host, 60, progress);
    benchmark::ClobberMemory();
  }
  page.RestoreInput();
  CountPixels(state, page);
}

void EdgePoints(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  ProgressCounter progress;
  BuildEdgeMap(page.view, host, 60, progress);
  const Rect search{9, 9, static_cast<int16_t>(page.page.height - 9),
                    static_cast<int16_t>(page.page.width - 9)};
  for (auto _ : state) {
    DoubleList xs;
    DoubleList ys;
    benchmark::DoNotOptimize(FindEdgePoints(page.view, host, search, xs, ys, progress));
  }
  page.RestoreInput();
  CountPixels(state, page);
}

void Angle(benchmark::State& state, BenchPage& page) {
  for (auto _ : state) {
    double angle = 0.0;
    benchmark::DoNotOptimize(EstimateAngle(page.xs, page.ys, 180, angle));
    benchmark::DoNotOptimize(angle);
  }
  state.counters["points"] = page.xs.count;
  CountPixels(state, page);
}

void Box(benchmark::State& state, BenchPage& page) {
  DoubleList xs;
  DoubleList ys;
  AllocList(xs, page.xs.count);
  AllocList(ys, page.ys.count);
  const AnalysisParams params = MakeAnalysisParams(static_cast<int16_t>(page.page.width),
                                                   static_cast<int16_t>(page.page.height));
  for (auto _ : state) {
    std::copy_n(page.xs.data.get(), page.xs.count, xs.data.get());
    std::copy_n(page.ys.data.get(), page.ys.count, ys.data.get());
    const PointD centre{page.page.width * 0.5, page.page.height * 0.5};
    StraightenPoints(xs, ys, 12.0, centre);
    BoxCorners corners;
    benchmark::DoNotOptimize(FitBox(xs, ys, corners, params));
    GrowQuad(corners, -1.0, -1.0);
    for (PointD& c : corners) RotatePoint(c, 12.0 * kRadiansPerDegree, centre);
    benchmark::DoNotOptimize(corners);
  }
  CountPixels(state, page);
}

// The whole chain. Each run gets the frame as delivered (the copy is not timed).
void Chain(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  BestRun best;
  for (auto _ : state) {
    state.PauseTiming();
    page.RestoreInput();
    state.ResumeTiming();
    best.Start();
    AnalysisResult result;
    RunAnalysis(page.view, host, result);
    benchmark::DoNotOptimize(result);
    best.Stop();
  }
  best.Report(state);
  page.RestoreInput();
  CountPixels(state, page);
}

// The whole chain with the portable kernels, where the processor would run
// the AVX2 ones: what the wider vectors buy.
void PortableChain(benchmark::State& state, BenchPage& page) {
  const bool wide = UseWideKernels();
  ForcePortableKernels(true);
  Chain(state, page);
  ForcePortableKernels(!wide);
}

// The whole chain through the literal stages.
void LiteralChain(benchmark::State& state, BenchPage& page) {
  QuietHost host;
  for (auto _ : state) {
    state.PauseTiming();
    page.RestoreInput();
    state.ResumeTiming();
    AnalysisResult result;
    RunAnalysisWith(Reference::LiteralStages(), page.view, host, result);
    benchmark::DoNotOptimize(result);
  }
  page.RestoreInput();
  CountPixels(state, page);
}

#if FRINGE_BENCH_CONTOURS
void Contours(benchmark::State& state, BenchPage& page) {
  BestRun best;
  for (auto _ : state) {
    best.Start();
    const Bench::ContourBox box =
        Bench::DetectByContour(page.output.data(), page.page.width, page.page.height,
                               page.page.channels, page.view.outRowBytes);
    benchmark::DoNotOptimize(box);
    best.Stop();
  }
  best.Report(state);
  CountPixels(state, page);
}
#endif

// Prints the usual table, then every figure as a multiple of the floors.
class FloorRatioReporter : public benchmark::ConsoleReporter {
 public:
  // The whole chain may take at most this multiple of the floor loop.
  static constexpr double kChainTarget = 3.0;

  // Colours only on a terminal, so that a saved run reads as plain text.
  explicit FloorRatioReporter(bool color) : ConsoleReporter(color ? OO_Color : OO_None) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs) {
      if (run.run_type != Run::RT_Iteration || run.iterations == 0) continue;
      const std::string name = run.run_name.str();
      const auto slash = name.find('/');
      if (slash == std::string::npos) continue;
      // CPU time in the run's unit (ms): other work on the machine counts
      // less. With repetitions the best one stands: noise only adds time.
      const double time = run.GetAdjustedCPUTime();
      const auto counter = run.counters.find("best_ms");
      const double best = counter == run.counters.end() ? std::numeric_limits<double>::infinity()
                                                        : static_cast<double>(counter->second);
      const std::string stage = name.substr(0, slash);
      // The page, without any suffix the run's settings add to the name.
      const auto end = name.find('/', slash + 1);
      const std::string page =
          name.substr(slash + 1, end == std::string::npos ? std::string::npos : end - slash - 1);
      const auto same = std::find_if(rows_.begin(), rows_.end(), [&](const Row& row) {
        return row.stage == stage && row.page == page;
      });
      if (same == rows_.end()) {
        rows_.push_back({stage, page, time, best});
      } else {
        same->time = std::min(same->time, time);
        same->best = std::min(same->best, best);
      }
    }
  }

  void Finalize() override {
    ConsoleReporter::Finalize();
    std::map<std::string, std::map<std::string, double>> times;  // page, stage
    std::vector<std::string> pages;
    for (const Row& row : rows_) {
      if (times.find(row.page) == times.end()) pages.push_back(row.page);
      times[row.page][row.stage] = row.time;
    }
    std::printf(
        "\nCPU time per frame as a multiple of the floors (each a single read of the frame):\n");
    std::printf("  %-16s %-20s %10s %12s %12s %9s\n", "page", "stage", "ms", "x floor",
                "x bandwidth", "of chain");
    for (const std::string& page : pages) {
      const auto& stage = times[page];
      const double floor = Find(stage, "MemoryFloor");
      const double bandwidth = Find(stage, "MemoryBandwidth");
      const double chain = Find(stage, "RunAnalysis");
      for (const Row& row : rows_) {
        if (row.page != page) continue;
        std::printf("  %-16s %-20s %10.3f %12s %12s %9s\n", page.c_str(), row.stage.c_str(),
                    row.time, Ratio(row.time, floor).c_str(), Ratio(row.time, bandwidth).c_str(),
                    IsStage(row.stage) ? Share(row.time, chain).c_str() : "");
      }
    }
    // Both ways of taking the time, each with its verdict: the CPU time per
    // iteration (as in the table) and the best single run by the wall clock.
    std::map<std::string, std::map<std::string, double>> bests;  // page, stage
    for (const Row& row : rows_) bests[row.page][row.stage] = row.best;
    std::printf("\nTargets (CPU time per iteration | best single run):\n");
    for (const std::string& page : pages) {
      PrintRatio(page, "chain / floor", times[page], bests[page], "RunAnalysis", "MemoryFloor",
                 true);
      PrintRatio(page, "chain / OpenCV contours", times[page], bests[page], "RunAnalysis",
                 "OpenCVContours", false);
    }
  }

 private:
  static double Find(const std::map<std::string, double>& stages, const char* name) {
    const auto found = stages.find(name);
    return found == stages.end() ? 0.0 : found->second;
  }
  static void PrintRatio(const std::string& page, const char* what,
                         const std::map<std::string, double>& times,
                         const std::map<std::string, double>& bests, const char* top,
                         const char* bottom, bool target) {
    const double cpu = Quotient(Find(times, top), Find(times, bottom));
    const double best = Quotient(Find(bests, top), Find(bests, bottom));
    if (cpu <= 0.0) return;
    std::printf("  %-16s %-24s %6.2f | %6.2f", page.c_str(), what, cpu, best);
    if (target) {
      std::printf("  (at most %.1f: %s | %s)", kChainTarget, Verdict(cpu), Verdict(best));
    }
    std::printf("\n");
  }
  static double Quotient(double top, double bottom) {
    if (!(top > 0.0) || !(bottom > 0.0) || top == std::numeric_limits<double>::infinity() ||
        bottom == std::numeric_limits<double>::infinity()) {
      return 0.0;
    }
    return top / bottom;
  }
  static const char* Verdict(double ratio) {
    if (ratio <= 0.0) return "-";
    return ratio <= kChainTarget ? "met" : "NOT met";
  }
  static bool IsStage(const std::string& name) {
    return name == "ComputeProfiles" || name == "ClassifyPosition" || name == "BuildEdgeMap" ||
           name == "FindEdgePoints" || name == "EstimateAngle" || name == "BoxFit";
  }
  static std::string Ratio(double time, double base) {
    if (base <= 0.0) return "-";
    char text[32];
    std::snprintf(text, sizeof text, "%.2f x", time / base);
    return text;
  }
  static std::string Share(double time, double chain) {
    if (chain <= 0.0) return "-";
    char text[32];
    std::snprintf(text, sizeof text, "%.1f %%", 100.0 * time / chain);
    return text;
  }

  struct Row {
    std::string stage;
    std::string page;
    double time;  // CPU time per iteration, ms
    double best;  // quickest single iteration by the wall clock, ms (infinite: not taken)
  };
  std::vector<Row> rows_;
};

void Register() {
  using Body = void (*)(benchmark::State&, BenchPage&);
  const std::pair<const char*, Body> stages[] = {
    {"MemoryFloor", MemoryFloor},
    {"MemoryBandwidth", MemoryBandwidth},
    {"ComputeProfiles", Profiles},
    {"ClassifyPosition", Classification},
    {"BuildEdgeMap", EdgeMap},
    {"FindEdgePoints", EdgePoints},
    {"EstimateAngle", Angle},
    {"BoxFit", Box},
    {"RunAnalysis", Chain},
    {"RunAnalysisPortable", PortableChain},
    {"LiteralRunAnalysis", LiteralChain},
#if FRINGE_BENCH_CONTOURS
    {"OpenCVContours", Contours},
#endif
  };
  for (auto& page : Bench::Pages()) {
    for (const auto& [stage, body] : stages) {
      BenchPage* p = page.get();
      benchmark::RegisterBenchmark((std::string(stage) + "/" + p->name).c_str(),
                                   [body, p](benchmark::State& state) { body(state, *p); })
          ->Unit(benchmark::kMillisecond);
    }
  }
}

}  // namespace

// --portable_kernels runs every benchmark with the portable kernels.
bool TakePortableFlag(int& argc, char** argv) {
  bool found = false;
  int kept = 1;
  for (int i = 1; i < argc; ++i) {
    if (std::string(argv[i]) == "--portable_kernels") {
      found = true;
    } else {
      argv[kept++] = argv[i];
    }
  }
  argc = kept;
  return found;
}

int main(int argc, char** argv) {
  if (TakePortableFlag(argc, argv)) ForcePortableKernels(true);
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  Register();
  FloorRatioReporter reporter(isatty(fileno(stdout)) != 0);
  benchmark::RunSpecifiedBenchmarks(&reporter);
  benchmark::Shutdown();
  return 0;
}
