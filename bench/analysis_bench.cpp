// Benchmarks of each analysis stage and of the whole chain, in megapixels of
// frame per second, beside a loop that only reads the frame once (the
// memory floor). The summary at the end gives each figure as a multiple of
// the floor's time on the same page.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <cstdio>
#include <functional>
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
#include "filter/analysis/profiles.h"

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

// Reads every byte of the frame once, as fast as a plain loop can.
void MemoryFloor(benchmark::State& state, BenchPage& page) {
  for (auto _ : state) {
    uint64_t sum = 0;
    const uint8_t* p = page.output.data();
    const size_t n = page.output.size();
    for (size_t i = 0; i < n; ++i) sum += p[i];
    benchmark::DoNotOptimize(sum);
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
  for (auto _ : state) {
    state.PauseTiming();
    page.RestoreInput();
    state.ResumeTiming();
    AnalysisResult result;
    RunAnalysis(page.view, host, result);
    benchmark::DoNotOptimize(result);
  }
  page.RestoreInput();
  CountPixels(state, page);
}

// Prints the usual table, then every figure as a multiple of the floor.
class FloorRatioReporter : public benchmark::ConsoleReporter {
 public:
  // Colours only on a terminal, so that a saved run reads as plain text.
  explicit FloorRatioReporter(bool color) : ConsoleReporter(color ? OO_Color : OO_None) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs) {
      if (run.run_type != Run::RT_Iteration || run.iterations == 0) continue;
      const std::string name = run.benchmark_name();
      const auto slash = name.find('/');
      if (slash == std::string::npos) continue;
      const double seconds =
          run.GetAdjustedCPUTime();  // CPU: other work on the machine does not count
      rows_.push_back({name.substr(0, slash), name.substr(slash + 1), seconds});
    }
  }

  void Finalize() override {
    ConsoleReporter::Finalize();
    std::map<std::string, double> floors;
    for (const Row& row : rows_) {
      if (row.stage == "MemoryFloor") floors[row.page] = row.time;
    }
    if (floors.empty()) return;
    std::printf(
        "\nCPU time per frame as a multiple of the memory floor (one read of the frame):\n");
    for (const Row& row : rows_) {
      const auto floor = floors.find(row.page);
      if (floor == floors.end() || floor->second <= 0.0) continue;
      std::printf("  %-16s %-16s %8.1f x\n", row.page.c_str(), row.stage.c_str(),
                  row.time / floor->second);
    }
  }

 private:
  struct Row {
    std::string stage;
    std::string page;
    double time;
  };
  std::vector<Row> rows_;
};

void Register() {
  using Body = void (*)(benchmark::State&, BenchPage&);
  const std::pair<const char*, Body> stages[] = {
      {"MemoryFloor", MemoryFloor},
      {"ComputeProfiles", Profiles},
      {"ClassifyPosition", Classification},
      {"BuildEdgeMap", EdgeMap},
      {"FindEdgePoints", EdgePoints},
      {"EstimateAngle", Angle},
      {"BoxFit", Box},
      {"RunAnalysis", Chain},
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

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  Register();
  FloorRatioReporter reporter(isatty(fileno(stdout)) != 0);
  benchmark::RunSpecifiedBenchmarks(&reporter);
  benchmark::Shutdown();
  return 0;
}
