// Truth files: NAME.truth.json beside each page image, holding whether the
// page has a photo and the paper's outline in continuous pixel coordinates
// (pixel (x, y) covers [x, x + 1) x [y, y + 1)).
#pragma once

#include <string>

#include "accuracy/evaluation.h"

namespace Accuracy {

// Throws std::runtime_error naming the file and what is wrong with it.
Truth ReadTruthFile(const std::string& path);

void WriteTruthFile(const std::string& path, const Truth& truth);

// page.png -> page.truth.json
std::string TruthPathFor(const std::string& imagePath);

}  // namespace Accuracy
