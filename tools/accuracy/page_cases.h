// The pages an accuracy run scores: generated hard pages, or image files in
// a folder that each have a truth file beside them.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "accuracy/evaluation.h"
#include "accuracy/page_io.h"
#include "synth/hard_pages.h"

namespace Accuracy {

struct PageCase {
  std::string name;
  Truth truth;
  PageBuffer page;       // as scored
  int jpegQuality = 0;   // > 0: a JPEG page of this quality
  PageBuffer unencoded;  // a JPEG page before encoding: what gets written
};

// The page and its truth for one generated recipe; JPEG pages come back after
// a round trip through the encoder.
PageCase GeneratedCase(const Synth::HardPageRecipe& recipe);

// Image files under the folder (not recursive) that have a truth file, by name.
std::vector<std::string> PagesWithTruth(const std::string& folder);

PageCase FolderCase(const std::string& imagePath);

// Writes the page (PNG, or JPEG for JPEG pages) and its truth file into the
// folder; returns the image's path.
std::string WriteCase(const PageCase& c, const std::string& folder);

}  // namespace Accuracy
