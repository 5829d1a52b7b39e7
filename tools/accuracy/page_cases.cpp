// Generated and folder page cases.
#include "accuracy/page_cases.h"

#include <algorithm>
#include <filesystem>

#include "accuracy/truth_file.h"

namespace Accuracy {

PageCase GeneratedCase(const Synth::HardPageRecipe& recipe) {
  const Synth::HardPage hard = Synth::GenerateHardPage(recipe);
  PageCase c;
  c.name = std::string(Synth::HardKindName(recipe.kind)) + "-" + std::to_string(recipe.seed);
  c.truth.photo = hard.hasPhoto;
  c.truth.kind = std::string(Synth::HardKindName(recipe.kind));
  if (hard.hasPhoto) {
    for (size_t k = 0; k < 4; ++k) c.truth.corners[k] = {hard.paper[k][0], hard.paper[k][1]};
    c.truth.angle = recipe.angleDegrees;
  }
  c.page = PageBuffer{hard.page.width, hard.page.height, hard.page.channels, hard.page.pixels};
  c.jpegQuality = recipe.jpegQuality;
  if (recipe.jpegQuality > 0) {
    c.unencoded = c.page;
    c.page = JpegRoundTrip(c.unencoded, recipe.jpegQuality);
  }
  return c;
}

std::vector<std::string> PagesWithTruth(const std::string& folder) {
  namespace fs = std::filesystem;
  std::vector<std::string> pages;
  std::error_code ec;
  for (const auto& entry : fs::directory_iterator(folder, ec)) {
    if (!entry.is_regular_file()) continue;
    const std::string path = entry.path().string();
    if (entry.path().extension() == ".json") continue;
    if (fs::exists(TruthPathFor(path))) pages.push_back(path);
  }
  if (ec) throw std::runtime_error(folder + ": cannot list the folder: " + ec.message());
  std::sort(pages.begin(), pages.end());
  return pages;
}

PageCase FolderCase(const std::string& imagePath) {
  PageCase c;
  c.name = std::filesystem::path(imagePath).stem().string();
  c.truth = ReadTruthFile(TruthPathFor(imagePath));
  c.page = LoadPage(imagePath);
  return c;
}

std::string WriteCase(const PageCase& c, const std::string& folder) {
  std::filesystem::create_directories(folder);
  const std::string image =
      (std::filesystem::path(folder) / (c.name + (c.jpegQuality > 0 ? ".jpg" : ".png"))).string();
  // A JPEG page is written from before its encoding, so that reading the file
  // back gives the very page that was scored.
  if (c.jpegQuality > 0 && !c.unencoded.pixels.empty()) {
    SavePage(c.unencoded, image, c.jpegQuality);
  } else {
    SavePage(c.page, image, 90);
  }
  WriteTruthFile(TruthPathFor(image), c.truth);
  return image;
}

}  // namespace Accuracy
