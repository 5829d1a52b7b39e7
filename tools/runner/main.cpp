// fringe-runner: loads a module file and drives one complete filter run on a
// document it describes, printing what the host saw; or runs a set of
// synthetic pages and writes or compares their results.
#include <cinttypes>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>

#include "page_set.h"
#include "program_folder.h"
#include "runner_options.h"
#include "standin/error.h"
#include "standin/fourcc.h"
#include "standin/host.h"

namespace {

using Standin::FourCC;

constexpr int kExitProblem = 1;
constexpr int kExitUsage = 2;

std::vector<uint8_t> ReadRaw(const std::string& path, size_t expected) {
  std::ifstream file(path, std::ios::binary);
  if (!file) throw Standin::Error("cannot read raw pixels from '" + path + "'");
  std::vector<uint8_t> bytes((std::istreambuf_iterator<char>(file)),
                             std::istreambuf_iterator<char>());
  if (bytes.size() != expected) {
    throw Standin::Error("'" + path + "' holds " + std::to_string(bytes.size()) +
                         " bytes; the document needs " + std::to_string(expected));
  }
  return bytes;
}

Standin::Document MakeDocument(const Runner::Options& options) {
  int channels = options.imageMode == 1 ? 1 : 3;
  Standin::Document document(options.width, options.height, channels, options.alpha);
  document.imageMode = options.imageMode;
  if (options.planes) document.planes = *options.planes;
  if (options.rect) {
    document.filterRect = *options.rect;
    document.filterCase = options.alpha ? 5 : 2;
  }
  if (options.filterCase) document.filterCase = *options.filterCase;
  document.maxSpace = options.budget;
  int planes = channels + (options.alpha ? 1 : 0);
  size_t rowBytes = static_cast<size_t>(options.width) * static_cast<size_t>(planes);
  if (!options.rawFile.empty()) {
    document.SetPixels(ReadRaw(options.rawFile, rowBytes * static_cast<size_t>(options.height)),
                       static_cast<std::ptrdiff_t>(rowBytes), planes);
  } else {
    Synth::Page page = Synth::GeneratePage(options.page);
    document.SetPixels(std::move(page.pixels), static_cast<std::ptrdiff_t>(rowBytes), planes);
  }
  return document;
}

void PrintRecord(const std::vector<std::vector<uint8_t>>& records) {
  std::printf("record      %zu 'fRNG' record(s)\n", records.size());
  for (const auto& bytes : records) {
    if (bytes.size() != 18) {
      std::printf("            %zu bytes (not 18)\n", bytes.size());
      continue;
    }
    int16_t v[9];
    std::memcpy(v, bytes.data(), sizeof v);
    std::printf("            corners (%d, %d) (%d, %d) (%d, %d) (%d, %d), confidence %d\n", v[0],
                v[1], v[2], v[3], v[4], v[5], v[6], v[7], v[8]);
  }
}

void PrintDescriptor(const std::optional<Standin::Descriptor>& descriptor) {
  if (!descriptor) {
    std::printf("descriptor  none\n");
    return;
  }
  std::printf("descriptor  %zu keys\n", descriptor->Items().size());
  for (const Standin::DescriptorItem& item : descriptor->Items()) {
    std::string key = Standin::FourCCText(item.key);
    if (const double* value = std::get_if<double>(&item.value)) {
      uint64_t bits;
      std::memcpy(&bits, value, sizeof bits);
      std::printf("            %s  %.17g  (0x%016" PRIx64 ")\n", key.c_str(), *value, bits);
    } else {
      std::printf("            %s  %d\n", key.c_str(), std::get<int32_t>(item.value));
    }
  }
}

int RunSingle(const Runner::Options& options, Standin::Module& module) {
  Standin::Host host(module, MakeDocument(options));
  host.inputLayout.rowPadding = options.rowPadding;
  host.inputLayout.bottomUp = options.bottomUp;
  if (options.cancelAt > 0) host.CancelAt(options.cancelAt);
  Standin::RunReport report = host.Run({.continues = options.continues});

  const Standin::Document& doc = host.Doc();
  std::printf("module      %s\n", module.Path().c_str());
  std::printf("document    %d x %d, mode %d, %d planes, filter case %d, rect (%d, %d, %d, %d)\n",
              doc.width, doc.height, doc.imageMode, doc.planes, doc.filterCase, doc.filterRect[0],
              doc.filterRect[1], doc.filterRect[2], doc.filterRect[3]);
  const char* names[] = {"about", "parameters", "prepare", "start", "continue", "finish"};
  for (int selector = 1; selector <= 5; ++selector) {
    auto index = static_cast<size_t>(selector);
    if (!report.called[index]) {
      std::printf("%-11s not sent\n", names[index]);
    } else {
      std::printf("%-11s %d\n", names[index], report.results[index]);
    }
    if (selector == 2 && report.called[index]) {
      std::printf("            budget announced %d; after prepare: largest %d, buffer space %d\n",
                  doc.maxSpace, report.maxSpaceAfterPrepare, report.bufferSpaceAfterPrepare);
    }
  }
  const auto& progress = host.ProgressCalls();
  if (progress.empty()) {
    std::printf("progress    no calls\n");
  } else {
    std::printf("progress    %zu calls, last %d of %d\n", progress.size(), progress.back().first,
                progress.back().second);
  }
  std::printf("abort test  %d calls\n", host.AbortCalls());
  PrintRecord(host.Records(FourCC("fRNG")));
  PrintDescriptor(host.LastDescriptor());
  Standin::SuiteUse buffers = host.Suites().Use(Standin::kBufferSuiteName, 1);
  std::printf("suites      buffer suite acquired %d, blocks %d made, %d disposed\n",
              buffers.acquired, host.SuiteBuffers().made, host.SuiteBuffers().disposed);
  if (host.Problems().Empty()) {
    std::printf("host saw    no problems\n");
  } else {
    std::printf("host saw    %s", host.Problems().Text().c_str());
  }
  bool failed = !host.Problems().Empty();
  for (int16_t result : report.results) failed = failed || result != 0;
  return failed ? kExitProblem : 0;
}

std::vector<Runner::PageResult> RunPages(Standin::Module& module,
                                         const std::vector<Synth::PageRecipe>& recipes) {
  std::vector<Runner::PageResult> results;
  for (const Synth::PageRecipe& recipe : recipes) {
    Synth::Page page = Synth::GeneratePage(recipe);
    Standin::PageView view{
        page.width,   page.height,        recipe.color ? 3 : 1,
        recipe.alpha, page.pixels.data(), static_cast<std::ptrdiff_t>(page.width) * page.channels};
    results.push_back(Runner::ResultOf(page, Standin::Detect(module, view)));
  }
  return results;
}

std::vector<Synth::PageRecipe> PagesOf(const std::string& header) {
  if (header == "golden") return Runner::GoldenPages();
  int count = 0;
  unsigned long long seed = 0;
  if (std::sscanf(header.c_str(), "sweep %d %llu", &count, &seed) == 2 && count > 0) {
    return Runner::SweepPages(count, seed);
  }
  throw Standin::Error("results file of an unknown page set '" + header + "'");
}

int RunSet(const Runner::Options& options, Standin::Module& module) {
  std::string header =
      options.mode == Runner::Mode::Golden
          ? "golden"
          : "sweep " + std::to_string(options.sweepCount) + " " + std::to_string(options.sweepSeed);
  std::vector<Runner::PageResult> results = RunPages(module, PagesOf(header));
  std::ofstream out(options.resultsFile, std::ios::binary);
  Runner::WriteResults(out, header, results);
  if (!out) throw Standin::Error("cannot write '" + options.resultsFile + "'");
  int failed = 0;
  for (const auto& result : results) failed += result.failed ? 1 : 0;
  std::printf("%zu pages run, %d with an error; results in %s\n", results.size(), failed,
              options.resultsFile.c_str());
  return failed == 0 ? 0 : kExitProblem;
}

int Compare(const Runner::Options& options, Standin::Module& module) {
  std::ifstream in(options.resultsFile, std::ios::binary);
  if (!in) throw Standin::Error("cannot read '" + options.resultsFile + "'");
  std::string header;
  std::vector<Runner::PageResult> theirs = Runner::ReadResults(in, &header);
  std::vector<Synth::PageRecipe> recipes = PagesOf(header);
  if (theirs.size() != recipes.size()) {
    throw Standin::Error("'" + options.resultsFile + "' holds " + std::to_string(theirs.size()) +
                         " results for " + std::to_string(recipes.size()) + " pages");
  }
  std::vector<Runner::PageResult> ours = RunPages(module, recipes);
  int differing = 0, generatorDiffers = 0, failed = 0;
  for (size_t i = 0; i < ours.size(); ++i) {
    failed += ours[i].failed || theirs[i].failed ? 1 : 0;
    std::vector<std::string> differences = Runner::Differences(ours[i], theirs[i]);
    if (differences.empty()) continue;
    ++differing;
    if (ours[i].pageHash != theirs[i].pageHash) ++generatorDiffers;
    std::string list;
    for (const std::string& d : differences) list += (list.empty() ? "" : ", ") + d;
    std::printf("page %zu differs in %s\n  here:  %s\n  there: %s\n", i, list.c_str(),
                Runner::Describe(ours[i]).c_str(), Runner::Describe(theirs[i]).c_str());
  }
  std::printf("%s: %zu pages, %d differ (%d of them in the generated pixels), %d with an error\n",
              header.c_str(), ours.size(), differing, generatorDiffers, failed);
  return differing == 0 && failed == 0 ? 0 : kExitProblem;
}

}  // namespace

int main(int argc, char** argv) {
  Runner::Options options;
  try {
    options = Runner::ParseOptions(argc, argv);
  } catch (const Standin::Error& error) {
    std::fprintf(stderr, "fringe-runner: %s\n", error.what());
    return kExitUsage;
  }
  if (options.mode == Runner::Mode::Help) {
    std::fputs(Runner::UsageText(), stdout);
    return 0;
  }
  try {
    std::string path =
        options.module.empty()
            ? (std::filesystem::path(Runner::ProgramFolder(argv[0])) / "Fringe.9zf").string()
            : options.module;
    auto module = Standin::Module::Load(path, options.privateCopy);
    switch (options.mode) {
      case Runner::Mode::Golden:
      case Runner::Mode::Sweep:
        return RunSet(options, *module);
      case Runner::Mode::Compare:
        return Compare(options, *module);
      default:
        return RunSingle(options, *module);
    }
  } catch (const std::exception& error) {
    std::fprintf(stderr, "fringe-runner: %s\n", error.what());
    return kExitProblem;
  }
}
