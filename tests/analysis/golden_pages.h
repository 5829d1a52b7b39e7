// The fixed synthetic pages whose results are pinned bit for bit, shared by
// the golden results and the comparison with the literal stages.
#pragma once

#include <cstdint>
#include <vector>

#include "synth/page_generator.h"

namespace AnalysisTest {

struct GoldenPage {
  const char* name;
  Synth::PageRecipe recipe;
  int16_t filterCase;
};

std::vector<GoldenPage> GoldenPages();

}  // namespace AnalysisTest
