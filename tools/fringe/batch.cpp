// The batch coordinator.
#include "batch.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>
#include <thread>

#include "exit_codes.h"
#include "input_walk.h"
#include "output_dir.h"
#include "page_job.h"
#include "page_watchdog.h"
#include "photo_detector.h"
#include "progress.h"
#include "report_text.h"
#include "result_json.h"
#include "results_log.h"
#include "worker_pool.h"

namespace Fringe {

namespace {

void PrintLine(const std::string& line) {
  if (line.empty()) return;
  std::fwrite(line.data(), 1, line.size(), stdout);
  std::fputc('\n', stdout);
  std::fflush(stdout);
}

int JobCount(const Options& o) {
  if (o.jobs > 0) return o.jobs;
  const unsigned n = std::thread::hardware_concurrency();
  return n == 0 ? 1 : static_cast<int>(n);
}

}  // namespace

int RunBatch(const Options& o) {
  const bool writesFiles = o.page.outputs.outline || o.page.outputs.photo;
  const std::vector<InputEntry> entries =
      ExpandInputs(o.inputs, writesFiles ? o.page.outputDir : "");
  const bool batch = entries.size() > 1 || o.inputs.size() > 1;
  Progress progress(stderr, batch && !o.quiet, ::isatty(STDERR_FILENO) == 1, 0);
  if (entries.empty()) {
    progress.Error("no image files found");
    return kExitBadInput;
  }

  int exitCode = kExitOk;
  std::unique_ptr<ResultsLog> log;
  std::unique_ptr<OutputDir> outDir;
  try {
    if (!o.resultsFile.empty()) log = std::make_unique<ResultsLog>(o.resultsFile);
    // Made here so that a folder that cannot be created fails once, up front.
    if (writesFiles) outDir = std::make_unique<OutputDir>(o.page.outputDir);
  } catch (const PageError& e) {
    progress.Error(e.what());
    return ExitCodeFor(e.Kind());
  }
  if (log) {
    for (const std::string& w : log->Warnings()) progress.Warning(w);
  }

  // Sort the pages into those already recorded, those that cannot be read
  // as named, and those to process now.
  BatchCounts counts;
  std::vector<std::optional<PageResult>> results(entries.size());
  std::vector<bool> silent(entries.size(), false);
  std::vector<PageTask> tasks;
  std::vector<size_t> taskEntry;
  for (size_t i = 0; i < entries.size(); ++i) {
    const InputEntry& e = entries[i];
    if (!e.error.empty()) {
      results[i] = ErrorResult(e.task.display, ErrorKind::BadInput, e.error);
      exitCode = WorseExit(exitCode, kExitBadInput);
      ++counts.errors;
      progress.Error(e.task.display + ": " + e.error);
      continue;
    }
    if (log) {
      const auto found = log->Done().find(AsJsonText(e.task.display));
      if (found != log->Done().end()) {
        silent[i] = true;
        ++counts.resumed;
        exitCode = WorseExit(exitCode, ExitCodeOf(found->second));
        continue;
      }
    }
    tasks.push_back(e.task);
    taskEntry.push_back(i);
  }

  // Page results go to the results file as they finish and to standard
  // output in the order the pages were named.
  size_t nextPrint = 0;
  auto emit = [&]() {
    while (nextPrint < entries.size() && (silent[nextPrint] || results[nextPrint])) {
      if (results[nextPrint]) {
        const PageResult& r = *results[nextPrint];
        PrintLine(o.json ? JsonLine(r) : TextLine(r));
      }
      ++nextPrint;
    }
  };
  emit();

  Progress pageProgress(stderr, batch && !o.quiet, ::isatty(STDERR_FILENO) == 1, tasks.size());
  bool logBroken = false;
  auto done = [&](size_t k, PageResult r) {
    const size_t i = taskEntry[k];
    if (log && !logBroken) {
      try {
        log->Append(r);
      } catch (const PageError& e) {
        logBroken = true;
        pageProgress.Error(e.what());
        exitCode = WorseExit(exitCode, kExitCannotWrite);
      }
    }
    if (r.status == PageStatus::Found) ++counts.found;
    if (r.status == PageStatus::NotFound) ++counts.notFound;
    if (r.status == PageStatus::Error) {
      ++counts.errors;
      pageProgress.Error(r.file + ": " + r.error);
    }
    exitCode = WorseExit(exitCode, ExitCodeOf(r));
    pageProgress.PageDone(r);
    results[i] = std::move(r);
    emit();
  };

  if (!tasks.empty()) {
    const std::string modulePath = o.modulePath.empty() ? DefaultModulePath() : o.modulePath;
    const int jobs = JobCount(o);
    try {
      // Loaded here even for parallel runs: a module that cannot be loaded
      // is one clear error rather than one per page.
      PhotoDetector detector(modulePath);
      if (tasks.size() == 1) {
        PageProcessor processor(detector, o.page);
        PageWatchdog watchdog(o.pageTimeout, [&] {
          done(0, ErrorResult(tasks[0].display, ErrorKind::Internal,
                              "stopped after " + std::to_string(o.pageTimeout) +
                                  " s (--page-timeout) while processing this page"));
          std::fflush(nullptr);
          std::_Exit(WorseExit(exitCode, kExitInternal));
        });
        PageResult result = processor.Process(tasks[0]);
        watchdog.Disarm();
        done(0, std::move(result));
      } else {
        // Batches run in worker processes even one at a time, so that a page
        // that brings the module down or hangs costs only that page.
        WorkerPool(jobs, modulePath, o.page, o.pageTimeout).Run(tasks, done);
      }
    } catch (const PageError& e) {
      pageProgress.Error(e.what());
      return WorseExit(exitCode, ExitCodeFor(e.Kind()));
    }
  }
  if (batch) pageProgress.Summary(counts);
  return exitCode;
}

}  // namespace Fringe
