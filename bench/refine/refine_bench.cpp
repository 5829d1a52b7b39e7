// Refinement against detection on 2000 x 1500 pages: the module through the
// stand-in host (the tool's road), the same analysis in memory, page
// preparation (which also measures the lid), refinement alone (given that
// lid, as in the pipeline) and the whole pipeline. The summary at the
// end gives refinement's CPU time as a share of detection's on each page.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include <unistd.h>

#include "accuracy/memory_detector.h"
#include "accuracy/module_detector.h"
#include "accuracy/page_cases.h"
#include "refine/page_prep.h"
#include "refine/pipeline.h"
#include "refine/refine.h"

namespace {

struct BenchPage {
  std::string name;
  Accuracy::PageCase page;
  Refine::ModuleAnswer answer;    // the module's, for refinement alone
  Refine::RefineOptions options;  // with the lid measured by preparation, as the pipeline has it
};

std::vector<std::unique_ptr<BenchPage>>& Pages() {
  static std::vector<std::unique_ptr<BenchPage>> pages;
  return pages;
}

Refine::Detector& Module() {
  static Accuracy::ModuleDetector detector(Accuracy::ModuleNextToProgram());
  return detector;
}

void DetectModule(benchmark::State& state, BenchPage& page) {
  for (auto _ : state)
    benchmark::DoNotOptimize(Module().Detect(page.page.page.View(), std::nullopt));
}

void DetectInMemory(benchmark::State& state, BenchPage& page) {
  Accuracy::MemoryDetector detector;
  for (auto _ : state)
    benchmark::DoNotOptimize(detector.Detect(page.page.page.View(), std::nullopt));
}

void Prepare(benchmark::State& state, BenchPage& page) {
  for (auto _ : state) benchmark::DoNotOptimize(Refine::PreparePage(page.page.page.View()));
}

void Refine(benchmark::State& state, BenchPage& page) {
  for (auto _ : state)
    benchmark::DoNotOptimize(
        Refine::RefineOutline(page.page.page.View(), page.answer, page.options));
}

void Pipeline(benchmark::State& state, BenchPage& page) {
  for (auto _ : state)
    benchmark::DoNotOptimize(Refine::DetectAndRefine(Module(), page.page.page.View()));
}

// The usual table, then refinement and preparation as shares of detection.
class ShareReporter : public benchmark::ConsoleReporter {
 public:
  explicit ShareReporter(bool color) : ConsoleReporter(color ? OO_Color : OO_None) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs) {
      // Single runs, or the median of repeated ones.
      const bool median = run.run_type == Run::RT_Aggregate && run.aggregate_name == "median";
      if (!median && (run.run_type != Run::RT_Iteration || run.iterations == 0)) continue;
      const std::string name = run.run_name.function_name;
      const auto slash = name.find('/');
      if (slash == std::string::npos) continue;
      times_[name.substr(slash + 1)][name.substr(0, slash)] = run.GetAdjustedCPUTime();
    }
  }

  void Finalize() override {
    ConsoleReporter::Finalize();
    std::printf("\nCPU time as a share of the module's detection through the stand-in host:\n");
    for (const auto& [page, stages] : times_) {
      const auto detect = stages.find("DetectModule");
      if (detect == stages.end() || detect->second <= 0.0) continue;
      for (const char* stage : {"DetectInMemory", "Prepare", "Refine"}) {
        const auto it = stages.find(stage);
        if (it != stages.end())
          std::printf("  %-14s %-16s %6.1f %%\n", page.c_str(), stage,
                      100.0 * it->second / detect->second);
      }
    }
  }

 private:
  std::map<std::string, std::map<std::string, double>> times_;
};

void Register() {
  const Synth::HardKind kinds[] = {Synth::HardKind::kPlain, Synth::HardKind::kShadowBand,
                                   Synth::HardKind::kWhiteBorder};
  for (const auto kind : kinds) {
    auto page = std::make_unique<BenchPage>();
    page->name = std::string(Synth::HardKindName(kind));
    page->page = Accuracy::GeneratedCase(Synth::MakeHardPageRecipe(kind, 1, 2000, 1500));
    page->answer = Module().Detect(page->page.page.View(), std::nullopt);
    page->options.lid = Refine::SurveyPage(page->page.page.View()).lid;
    Pages().push_back(std::move(page));
  }
  using Body = void (*)(benchmark::State&, BenchPage&);
  const std::pair<const char*, Body> stages[] = {{"DetectModule", DetectModule},
                                                 {"DetectInMemory", DetectInMemory},
                                                 {"Prepare", Prepare},
                                                 {"Refine", Refine},
                                                 {"Pipeline", Pipeline}};
  for (auto& page : Pages()) {
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
  try {
    Accuracy::StartImageLibrary(argv[0]);
    Register();
  } catch (const std::exception& e) {
    std::fprintf(stderr, "fringe_refine_bench: %s\n", e.what());
    return 1;
  }
  ShareReporter reporter(isatty(fileno(stdout)) != 0);
  benchmark::RunSpecifiedBenchmarks(&reporter);
  benchmark::Shutdown();
  return 0;
}
