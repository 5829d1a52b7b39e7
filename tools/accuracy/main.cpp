// fringe-accuracy: scores the module's raw answers and the refined outlines
// side by side on pages whose true outline is known.
#include <CLI/CLI.hpp>

#include <cstdio>
#include <exception>
#include <fstream>
#include <memory>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "accuracy/memory_detector.h"
#include "accuracy/module_detector.h"
#include "accuracy/page_cases.h"
#include "accuracy/page_io.h"
#include "accuracy/report.h"
#include "accuracy/run.h"
#include "refine/aligned_profile.h"
#include "refine/side_reading.h"
#include "synth/hard_pages.h"

namespace {

constexpr int kExitOk = 0;
constexpr int kExitFailure = 1;
constexpr int kExitUsage = 64;

struct Settings {
  int generate = 0;
  uint32_t seed = 1;
  std::string kinds;
  std::string pages;
  std::string write;
  std::string module;
  bool inMemory = false;
  bool noPrepare = false;
  bool byKind = false;
  bool perPage = false;
  std::string jsonFile;
  std::string inspect;               // page name, to print its sides' profiles
  std::vector<std::string> recipes;  // single pages: kind,seed,width,height
};

// kind,seed,width,height: one page of the set's kind, as the tests make them.
Synth::HardPageRecipe ParseRecipe(const std::string& text) {
  std::stringstream in(text);
  std::string kind, seed, width, height;
  std::getline(in, kind, ',');
  std::getline(in, seed, ',');
  std::getline(in, width, ',');
  std::getline(in, height, ',');
  const auto k = Synth::HardKindFromName(kind);
  if (!k || seed.empty() || width.empty() || height.empty())
    throw CLI::ValidationError("--recipe", "expected kind,seed,width,height, not \"" + text + "\"");
  try {
    return Synth::MakeHardPageRecipe(*k, static_cast<uint32_t>(std::stoul(seed)), std::stoi(width),
                                     std::stoi(height));
  } catch (const std::logic_error&) {
    throw CLI::ValidationError("--recipe", "expected numbers in \"" + text + "\"");
  }
}

std::vector<Synth::HardPageRecipe> SelectRecipes(const Settings& s) {
  std::set<Synth::HardKind> wanted;
  std::stringstream list(s.kinds);
  for (std::string name; std::getline(list, name, ',');) {
    if (name.empty()) continue;
    const auto kind = Synth::HardKindFromName(name);
    if (!kind) throw CLI::ValidationError("--kinds", "unknown kind \"" + name + "\"");
    wanted.insert(*kind);
  }
  std::vector<Synth::HardPageRecipe> recipes;
  // Walk the cycling set until enough pages of the wanted kinds are chosen.
  const int kinds = static_cast<int>(Synth::HardKind::kCount);
  const int span =
      wanted.empty() ? s.generate : s.generate * kinds / static_cast<int>(wanted.size()) + kinds;
  for (const auto& recipe : Synth::HardPageSet(span, s.seed)) {
    if (!wanted.empty() && !wanted.count(recipe.kind)) continue;
    if (static_cast<int>(recipes.size()) == s.generate) break;
    recipes.push_back(recipe);
  }
  return recipes;
}

nlohmann::ordered_json ScoreJson(const Accuracy::Score& s) {
  return {{"reported", s.reported},
          {"found", s.found},
          {"max_corner_error", s.maxCornerError},
          {"corner_errors", s.cornerError},
          {"angle_error", s.angleError}};
}

// Diagnostics: a side's typical profile and how it was read.
void PrintSide(int side, const Refine::AlignedProfile& p, const Refine::SideReading& r) {
  std::printf(
      "side %d (%s): %s; edge at %.2f, polarity %+d, band %.1f, margin %s at %.2f; lid %.1f "
      "(expected %.1f), "
      "noise %.2f, slope %.5f\n",
      side, Refine::kSideNames[static_cast<size_t>(side)], r.note.c_str(), r.offset, r.polarity,
      r.bandWidth, r.margin ? "yes" : "no", r.innerOffset, r.lid, r.expectedLid, r.noise, p.slope);
  for (int k = 0; k < p.Size(); ++k)
    std::printf("  %7.1f %8.2f %6.2f\n", p.OffsetOf(k), p.mean[static_cast<size_t>(k)],
                p.roughness[static_cast<size_t>(k)]);
}

int Run(const Settings& s) {
  std::unique_ptr<Refine::Detector> detector;
  if (s.inMemory) {
    detector = std::make_unique<Accuracy::MemoryDetector>();
  } else {
    detector = std::make_unique<Accuracy::ModuleDetector>(
        s.module.empty() ? Accuracy::ModuleNextToProgram() : s.module);
  }
  Refine::PipelineOptions options;
  options.prepare = !s.noPrepare;

  std::vector<Accuracy::PageOutcome> outcomes;
  std::ofstream json;
  if (!s.jsonFile.empty()) {
    json.open(s.jsonFile);
    if (!json) throw std::runtime_error(s.jsonFile + ": cannot write");
  }
  auto score = [&](const Accuracy::PageCase& c) {
    Refine::PipelineOptions pageOptions = options;
    if (c.name == s.inspect) pageOptions.refinement.inspect = PrintSide;
    outcomes.push_back(Accuracy::RunCase(*detector, c, pageOptions));
    if (c.name == s.inspect) {
      auto print = [](const char* what, const Refine::Quad& q) {
        std::printf("%-8s", what);
        for (const auto& p : q) std::printf(" (%.2f, %.2f)", p.x, p.y);
        std::printf("\n");
      };
      print("truth", c.truth.corners);
      print("module", outcomes.back().rawAnswer.corners);
      print("refined", outcomes.back().refinedAnswer.corners);
    }
    const Accuracy::PageOutcome& o = outcomes.back();
    if (s.perPage) std::fprintf(stderr, "%s\n", Accuracy::PageLine(o).c_str());
    if (json.is_open()) {
      nlohmann::ordered_json j{
          {"page", o.name},
          {"kind", o.kind},
          {"module", ScoreJson(o.raw)},
          {"refined", ScoreJson(o.refined)},
          {"status", o.status},
          {"sides", o.sides},
          {"preparations", o.preparations},
          {"times_ms", {{"detect", o.detectMs}, {"prepare", o.prepareMs}, {"refine", o.refineMs}}}};
      json << j.dump() << '\n';
    }
  };

  std::string source;
  if (!s.pages.empty()) {
    const auto files = Accuracy::PagesWithTruth(s.pages);
    if (files.empty()) throw std::runtime_error(s.pages + ": no page with a truth file beside it");
    for (const auto& file : files) score(Accuracy::FolderCase(file));
    source = std::to_string(files.size()) + " pages from " + s.pages;
  } else {
    auto recipes = SelectRecipes(s);
    for (const std::string& text : s.recipes) recipes.push_back(ParseRecipe(text));
    for (const auto& recipe : recipes) {
      const Accuracy::PageCase c = Accuracy::GeneratedCase(recipe);
      if (!s.write.empty()) Accuracy::WriteCase(c, s.write);
      score(c);
    }
    source =
        std::to_string(recipes.size()) + " generated hard pages, seed " + std::to_string(s.seed);
  }

  std::printf("Accuracy on %s (%s)\n\n%s", source.c_str(),
              s.inMemory ? "analysis in memory" : "module through the stand-in host",
              Accuracy::SummaryTable(outcomes).c_str());
  if (s.byKind) std::printf("\n%s", Accuracy::KindTable(outcomes).c_str());
  return kExitOk;
}

}  // namespace

int main(int argc, char** argv) {
  CLI::App app{
      "fringe-accuracy: the module's raw answers and the refined outlines, side by side, on pages "
      "whose\n"
      "true outline is known. Pages are generated (--generate N: the hard page set, every kind in "
      "turn)\n"
      "or read from a folder (--pages DIR: each image with NAME.truth.json beside it). A photo is "
      "found\n"
      "when all four corners lie within 10 px of the truth; corner errors are taken over every "
      "page\n"
      "where a photo was reported. Prints a Markdown table.",
      "fringe-accuracy"};
  Settings s;
  auto* generate = app.add_option("--generate", s.generate, "Generate N hard pages")
                       ->check(CLI::Range(1, 100000));
  auto* pages = app.add_option("--pages", s.pages, "Score the pages in this folder")
                    ->check(CLI::ExistingDirectory);
  generate->excludes(pages);
  app.add_option("--seed", s.seed, "Seed of the generated set")->needs(generate);
  app.add_option("--kinds", s.kinds,
                 "Only these kinds, comma separated: plain, white-border, shadow-band, "
                 "shadow-ramp, sheared, bed-strip, grey-lid, uneven-lid, low-contrast, dark-photo, "
                 "heavy-noise, jpeg, off-page, dust, blank")
      ->needs(generate);
  app.add_option("--write", s.write,
                 "Also write the generated pages and truth files into this folder")
      ->needs(generate);
  auto* module = app.add_option("--module", s.module,
                                "Module file (default: Fringe.9zf next to this program)");
  app.add_flag("--in-memory", s.inMemory, "Run the analysis in memory instead of the module")
      ->excludes(module);
  app.add_flag("--no-prepare", s.noPrepare,
               "Refine the module's first answer only; no page preparation");
  app.add_flag("--by-kind", s.byKind, "Add a table kind by kind");
  app.add_flag("--per-page", s.perPage, "A line per page on standard error");
  app.add_option("--json", s.jsonFile, "Write one JSON object per page to this file");
  app.add_option("--recipe", s.recipes,
                 "Also score this page of the set: kind,seed,width,height (diagnostics)")
      ->excludes(pages);
  app.add_option("--inspect", s.inspect,
                 "Print the profiles across each side of the named page (diagnostics)");
  try {
    app.parse(argc, argv);
    if (s.generate == 0 && s.pages.empty() && s.recipes.empty())
      throw CLI::RequiredError("--generate or --pages");
  } catch (const CLI::ParseError& e) {
    const int code = app.exit(e);
    return code == 0 ? kExitOk : kExitUsage;
  }
  try {
    Accuracy::StartImageLibrary(argv[0]);
    return Run(s);
  } catch (const CLI::Error& e) {
    std::fprintf(stderr, "fringe-accuracy: %s\n", e.what());
    return kExitUsage;
  } catch (const std::exception& e) {
    std::fprintf(stderr, "fringe-accuracy: %s\n", e.what());
    return kExitFailure;
  }
}
