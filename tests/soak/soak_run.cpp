// One soak run from its seed, and the checks on it.
#include "soak_run.h"

#include <array>
#include <set>
#include <utility>
#include <vector>

#include "standin/host.h"
#include "standin/key_string_dictionary.h"
#include "synth/page_generator.h"

namespace Soak {

namespace {

using Standin::Proc;

constexpr uint32_t kRecordType = 0x66524E47;  // 'fRNG'

uint64_t Mix(uint64_t z) {
  z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ull;
  z = (z ^ (z >> 27)) * 0x94D049BB133111EBull;
  return z ^ (z >> 31);
}

// Procedures through which the module gives memory back: while one of them
// fails, what it holds cannot be returned, which is the host's doing.
bool GivesBack(Proc proc) {
  return proc == Proc::HandleDispose || proc == Proc::HandleUnlock || proc == Proc::BufferFree ||
         proc == Proc::BufferUnlock || proc == Proc::SuiteBufferDispose ||
         proc == Proc::SuiteRelease || proc == Proc::DescriptorClose || proc == Proc::RecordDelete;
}

bool IsLeak(const std::string& problem) {
  return problem.rfind("leaked ", 0) == 0 ||
         problem.find("opened and never closed") != std::string::npos ||
         problem.find("never disposed") != std::string::npos ||
         problem.find("never freed") != std::string::npos;
}

// The faults of one run and what they excuse.
struct FaultSet {
  std::set<int32_t> codes{0, 1, -50, -108, -109, -128};  // results the host may see
  bool leaksExcused = false;                             // memory cannot be given back
  bool closeMissing = false;                             // a descriptor token cannot be closed
  bool suitesExcused = false;                            // suites cannot be released
  std::string text;
};

Synth::PageRecipe RandomPage(Rng& rng) {
  Synth::PageRecipe recipe;
  // Mostly pages the analysis works through, now and then one too small for it.
  const bool tiny = rng.Chance(5);
  recipe.width = tiny ? rng.Range(1, 30) : rng.Range(27, 360);
  recipe.height = tiny ? rng.Range(1, 30) : rng.Range(27, 360);
  recipe.color = rng.Chance(60);
  recipe.alpha = rng.Chance(15);
  recipe.lidShadow = rng.Chance(20);
  recipe.noise = rng.Range(0, 60) / 10.0;
  recipe.seed = static_cast<uint32_t>(rng.Next());
  if (recipe.width >= 20 && recipe.height >= 20 && rng.Chance(85)) {
    const double w = recipe.width, h = recipe.height;
    recipe.photo = Synth::PhotoRecipe{w * rng.Range(30, 70) / 100.0, h * rng.Range(30, 70) / 100.0,
                                      w * rng.Range(20, 60) / 100.0, h * rng.Range(20, 60) / 100.0,
                                      rng.Range(-400, 400) / 10.0};
  }
  return recipe;
}

Standin::Document MakeDocument(const Synth::PageRecipe& recipe) {
  Synth::Page page = Synth::GeneratePage(recipe);
  Standin::Document doc(page.width, page.height, recipe.color ? 3 : 1, recipe.alpha);
  const auto rowBytes = static_cast<std::ptrdiff_t>(page.width) * page.channels;
  doc.SetPixels(std::move(page.pixels), rowBytes);
  return doc;
}

void AddFault(Rng& rng, Standin::Host& host, FaultSet& faults) {
  const auto proc = static_cast<Proc>(rng.Range(0, Standin::kProcCount - 1));
  const std::string name = Standin::ProcName(proc);
  switch (rng.Range(0, 5)) {
    case 0: {
      const int32_t at = rng.Range(1, 600);
      const bool sticky = rng.Chance(50);
      host.CancelAt(at, sticky);
      faults.text += " cancel@" + std::to_string(at) + (sticky ? "+" : "");
      break;
    }
    case 1:
    case 2: {
      static constexpr int32_t kCodes[] = {-108, -108, -1, -50, -109, -128, -9999, 5};
      const int32_t error = kCodes[rng.Range(0, 7)];
      const int32_t at = rng.Range(1, 40);
      const int32_t times = rng.Chance(50) ? -1 : rng.Range(1, 3);
      host.Faults().FailAt(proc, at, times, error);
      faults.codes.insert(error);
      faults.leaksExcused = faults.leaksExcused || GivesBack(proc);
      faults.closeMissing = faults.closeMissing || proc == Proc::DescriptorClose;
      faults.suitesExcused = faults.suitesExcused || proc == Proc::SuiteRelease;
      faults.text += " fail(" + name + "@" + std::to_string(at) + "x" + std::to_string(times) +
                     "=" + std::to_string(error) + ")";
      break;
    }
    case 3:
      host.Faults().Remove(proc);
      faults.closeMissing = faults.closeMissing || proc == Proc::DescriptorClose;
      faults.suitesExcused = faults.suitesExcused || proc == Proc::SuiteRelease;
      faults.text += " remove(" + name + ")";
      break;
    case 4: {
      // A host procedure that throws through the module: every unwinding path
      // is guarded, but not every one gives back the host memory it holds.
      // Suites are given back all the same, when the object goes.
      const int32_t at = rng.Range(1, 60);
      host.Faults().RaiseAt(proc, at);
      faults.leaksExcused = true;
      faults.closeMissing = true;
      faults.suitesExcused = faults.suitesExcused || proc == Proc::SuiteRelease;
      faults.text += " raise(" + name + "@" + std::to_string(at) + ")";
      break;
    }
    default: {
      const auto table = static_cast<Standin::Table>(rng.Range(0, Standin::kTableCount - 1));
      Standin::TableShape shape;
      shape.absent = rng.Chance(50);
      if (!shape.absent) shape.count = static_cast<int16_t>(rng.Range(0, 8));
      host.Faults().SetTable(table, shape);
      faults.closeMissing = faults.closeMissing || table == Standin::Table::DescriptorWrite;
      faults.suitesExcused = faults.suitesExcused || table == Standin::Table::BasicSuite;
      faults.text += " table" + std::to_string(static_cast<int>(table)) +
                     (shape.absent ? "(absent)" : "(count " + std::to_string(*shape.count) + ")");
      break;
    }
  }
}

void ShapeLayout(Rng& rng, Standin::BufferLayout& layout) {
  if (!rng.Chance(20)) return;
  layout.rowPadding = rng.Range(0, 9);
  layout.columnPadding = rng.Range(0, 2);
  layout.bottomUp = rng.Chance(50);
}

std::string CheckProblems(const Standin::Host& host, const FaultSet& faults, bool hostOrder,
                          Tally& tally) {
  std::string failure;
  for (const std::string& problem : host.Problems().All()) {
    if (IsLeak(problem)) {
      const bool tokenOnly = problem.find("descriptor write token") != std::string::npos;
      if (!hostOrder || faults.leaksExcused || (tokenOnly && faults.closeMissing)) {
        ++tally.excusedLeaks;
        continue;
      }
    }
    failure += "host saw: " + problem + "\n";
  }
  return failure;
}

// A run in host order whose first continue meets an abort test that raises,
// after everything before it went as the faults let it.
Standin::RunReport RunWithRaisingContinue(Standin::Host& host, const Standin::RunPlan& plan) {
  Standin::RunReport report;
  host.BeginRun();
  auto send = [&](int16_t selector) {
    report.called[static_cast<size_t>(selector)] = true;
    report.results[static_cast<size_t>(selector)] = host.Call(selector);
    return report.results[static_cast<size_t>(selector)] == 0 || !plan.stopOnFailure;
  };
  bool going = !plan.parameters || send(Standin::kParameters);
  going = going && send(Standin::kPrepare) && send(Standin::kStart);
  if (going) {
    host.Faults().RaiseAt(Proc::Abort, 1);
    going = send(Standin::kContinue);
  }
  if (going) send(Standin::kFinish);
  host.CheckRunEnd();
  return report;
}

}  // namespace

uint64_t Rng::Next() {
  state_ += 0x9E3779B97F4A7C15ull;
  return Mix(state_);
}

int32_t Rng::Range(int32_t low, int32_t high) {
  const auto span = static_cast<uint64_t>(static_cast<int64_t>(high) - low + 1);
  return static_cast<int32_t>(low + static_cast<int64_t>(Next() % span));
}

uint64_t RunSeed(uint64_t base, int64_t index) {
  return Mix(base ^ Mix(static_cast<uint64_t>(index) + 1));
}

RunOutcome SoakRun(Standin::Module& module, uint64_t seed, Tally& tally) {
  RunOutcome outcome;
  Rng rng(seed);
  const Synth::PageRecipe recipe = RandomPage(rng);
  outcome.what = std::to_string(recipe.width) + "x" + std::to_string(recipe.height) +
                 (recipe.color ? " rgb" : " gray") + (recipe.alpha ? "+alpha" : "") +
                 (recipe.photo ? " photo" : " blank");

  // The dictionary outlives the host that offers it.
  Standin::KeyStringDictionary dictionary;
  dictionary.Add("$$$/Vireo/Reporter/Title=Error", u"Fehler");
  Standin::Host host(module, MakeDocument(recipe));
  const bool translating = rng.Chance(50);
  if (translating)
    dictionary.OfferThrough(host.Suites(), Standin::TranslationRoute::KeyStringSuites);
  ShapeLayout(rng, host.inputLayout);
  ShapeLayout(rng, host.outputLayout);

  FaultSet faults;
  const int faultCount = rng.Chance(30) ? 0 : rng.Range(1, 3);
  for (int i = 0; i < faultCount; ++i) AddFault(rng, host, faults);
  outcome.what += faults.text.empty() ? " no faults" : faults.text;

  Standin::RunPlan plan;
  plan.parameters = rng.Chance(80);
  plan.continues = rng.Range(0, 2);
  plan.stopOnFailure = rng.Chance(90);
  outcome.what += " continues " + std::to_string(plan.continues) +
                  (plan.stopOnFailure ? "" : " no-stop") + (translating ? " translating" : "");

  const bool raisingContinue = rng.Chance(10);
  if (raisingContinue) {
    outcome.what += " raising continue";
    faults.leaksExcused = true;
  }
  const Standin::RunReport report =
      raisingContinue ? RunWithRaisingContinue(host, plan) : host.Run(plan);
  ++tally.runs;
  if (faultCount > 0) ++tally.faulted;
  tally.handlesMade += static_cast<int64_t>(host.Handles().Created());

  std::string& failure = outcome.failure;
  bool anyFailed = false;
  for (size_t s = 0; s < report.results.size(); ++s) {
    if (!report.called[s]) continue;
    anyFailed = anyFailed || report.results[s] != 0;
    if (faults.codes.count(report.results[s]) == 0) {
      failure += "selector " + std::to_string(s) + " answered " +
                 std::to_string(report.results[s]) + ", neither 0, 1 nor a host code\n";
    }
  }
  if (anyFailed) ++tally.failedRuns;
  if (report.called[Standin::kContinue] && report.results[Standin::kContinue] != 0 &&
      !report.called[Standin::kFinish]) {
    ++tally.survivors;
  }
  failure += CheckProblems(host, faults, plan.stopOnFailure, tally);

  const auto records = host.Records(kRecordType);
  if (records.size() > 1) failure += std::to_string(records.size()) + " 'fRNG' records\n";
  if (records.size() == 1 && records[0].size() == 18 && records[0][16] == 255) ++tally.photos;

  if (translating && !faults.suitesExcused) {
    for (const char* name : {"HS KeyString Suite", "HS KeyString Dictionary Suite"}) {
      const Standin::SuiteUse use = host.Suites().Use(name, 1);
      if (use.acquired != use.released) {
        failure += std::string(name) + " acquired " + std::to_string(use.acquired) +
                   " times, released " + std::to_string(use.released) + "\n";
      }
    }
  }
  if (!faults.suitesExcused && dictionary.LiveObjects() != 0) {
    failure += std::to_string(dictionary.LiveObjects()) + " translated strings never released\n";
  }
  return outcome;
}

std::string EndRunInProgress(Standin::Module& module) {
  Standin::Host host(module, Standin::Document(27, 27, 1));
  host.BeginRun();
  const int16_t result = host.Call(Standin::kFinish);
  std::string failure;
  if (result != 0) failure += "the closing finish answered " + std::to_string(result) + "\n";
  for (const std::string& problem : host.Problems().All()) failure += "host saw: " + problem + "\n";
  return failure;
}

}  // namespace Soak
