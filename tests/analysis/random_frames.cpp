// Randomised frames and their seeds.
#include "random_frames.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>

#include "filter/analysis/channels.h"
#include "synth/page_generator.h"

namespace AnalysisTest {

uint64_t Random::Next() {
  state_ += 0x9E3779B97F4A7C15ULL;
  uint64_t z = state_;
  z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ULL;
  z = (z ^ (z >> 27)) * 0x94D049BB133111EBULL;
  return z ^ (z >> 31);
}

int32_t Random::Between(int32_t lo, int32_t hi) {
  const auto span = static_cast<uint64_t>(static_cast<int64_t>(hi) - lo + 1);
  return static_cast<int32_t>(lo + static_cast<int64_t>(Next() % span));
}

bool Random::Chance(int32_t percent) {
  return Between(0, 99) < percent;
}

double Random::Unit() {
  return static_cast<double>(Next() >> 11) * (1.0 / 9007199254740992.0);
}

std::string FrameCase::Describe() const {
  std::ostringstream out;
  out << "seed " << seed << ": " << width << "x" << height << " mode " << imageMode << " planes "
      << colorPlanes << (alpha ? "+alpha" : "") << " case " << filterCase << " row pad "
      << layout.rowPadding << " pixel pad " << layout.pixelPadding
      << (layout.bottomUp ? " bottom-up" : "") << " content " << static_cast<int>(content)
      << (outputDiffers ? " output differs" : "") << " (replay: FRINGE_EQUALITY_SEED=" << seed
      << ")";
  return out.str();
}

FrameCase DrawFrameCase(uint64_t seed, int32_t largest) {
  Random r(seed);
  FrameCase c;
  c.seed = seed;
  const int32_t smallest = r.Chance(15) ? 1 : 27;
  c.width = r.Between(smallest, largest);
  c.height = r.Between(smallest, largest);
  static constexpr uint16_t kModes[] = {1, 3, 1, 3, 1, 3, 0, 2, 4, 8, 9, 7};
  c.imageMode = kModes[r.Between(0, 11)];
  const int16_t channels = Project::ChannelCount(c.imageMode, 0);
  c.colorPlanes = std::max<int32_t>(channels, 1);
  static constexpr int16_t kCases[] = {1, 1, 2, 3, 4, 5, 0};
  c.filterCase = kCases[r.Between(0, 6)];
  c.alpha = c.filterCase == 4 || c.filterCase == 5 || r.Chance(20);
  c.layout.rowPadding = r.Chance(50) ? 0 : r.Between(1, 13);
  c.layout.pixelPadding = r.Chance(70) ? 0 : r.Between(1, 3);
  c.layout.bottomUp = r.Chance(30);
  c.content = static_cast<Content>(r.Between(0, 4));
  c.outputDiffers = r.Chance(15);
  return c;
}

namespace {

void Put(TestFrame& frame, int32_t x, int32_t y, int32_t k, uint8_t value) {
  frame.Input().Pixel(x, y)[k] = value;
  frame.Output().Pixel(x, y)[k] = value;
}

void PaintPage(TestFrame& frame, const FrameCase& c, Random& r) {
  Synth::PageRecipe recipe;
  recipe.width = c.width;
  recipe.height = c.height;
  recipe.color = c.colorPlanes >= 3;
  recipe.alpha = c.alpha;
  recipe.pageAlpha = static_cast<uint8_t>(r.Between(0, 255));
  recipe.lidShadow = r.Chance(30);
  recipe.noise = r.Unit() * 6.0;
  recipe.seed = static_cast<uint32_t>(r.Next());
  recipe.photo =
      Synth::PhotoRecipe{c.width * (0.3 + 0.4 * r.Unit()), c.height * (0.3 + 0.4 * r.Unit()),
                         c.width * (0.2 + 0.7 * r.Unit()), c.height * (0.2 + 0.7 * r.Unit()),
                         -50.0 + 100.0 * r.Unit()};
  const Synth::Page page = Synth::GeneratePage(recipe);
  const int32_t pagePlanes = page.channels;
  const int32_t pageColors = c.alpha ? pagePlanes - 1 : pagePlanes;
  for (int32_t y = 0; y < c.height; ++y) {
    for (int32_t x = 0; x < c.width; ++x) {
      const uint8_t* source = &page.pixels[(static_cast<size_t>(y) * c.width + x) * pagePlanes];
      for (int32_t k = 0; k < c.colorPlanes; ++k) {
        Put(frame, x, y, k, source[std::min(k, pageColors - 1)]);
      }
      if (c.alpha) Put(frame, x, y, c.colorPlanes, source[pagePlanes - 1]);
    }
  }
}

uint8_t NearLimit(Random& r) {
  static constexpr uint8_t kValues[] = {0, 9, 10, 11, 49, 50, 51, 100, 145, 146, 254, 255};
  return r.Chance(50) ? kValues[r.Between(0, 11)] : static_cast<uint8_t>(r.Between(0, 255));
}

void PaintBytes(TestFrame& frame, const FrameCase& c, Random& r) {
  const int32_t planes = frame.Planes();
  const int32_t ground = r.Between(0, 255);
  const int32_t period = r.Between(1, 9);
  const int32_t pattern = r.Between(0, 3);
  for (int32_t y = 0; y < c.height; ++y) {
    for (int32_t x = 0; x < c.width; ++x) {
      for (int32_t k = 0; k < planes; ++k) {
        uint8_t value = 0;
        switch (c.content) {
          case Content::kNoise:
            value = static_cast<uint8_t>(r.Between(0, 255));
            break;
          case Content::kExtremes: {
            const bool on = pattern == 0   ? (x / period) % 2 == 0
                            : pattern == 1 ? (y / period) % 2 == 0
                            : pattern == 2 ? ((x + y) / period) % 2 == 0
                                           : ground > 127;
            value = on ? 255 : 0;
            break;
          }
          case Content::kNearLimits:
            value = NearLimit(r);
            break;
          default:
            value = static_cast<uint8_t>(ground);
            break;
        }
        Put(frame, x, y, k, value);
      }
    }
  }
  if (c.content != Content::kBlocks) return;
  const int32_t blocks = r.Between(1, 12);
  for (int32_t b = 0; b < blocks; ++b) {
    const int32_t x0 = r.Between(0, c.width - 1);
    const int32_t y0 = r.Between(0, c.height - 1);
    const int32_t x1 = std::min(c.width, x0 + r.Between(1, c.width));
    const int32_t y1 = std::min(c.height, y0 + r.Between(1, c.height));
    const auto value = static_cast<uint8_t>(r.Between(0, 255));
    for (int32_t y = y0; y < y1; ++y) {
      for (int32_t x = x0; x < x1; ++x) {
        for (int32_t k = 0; k < planes; ++k) Put(frame, x, y, k, value);
      }
    }
  }
}

}  // namespace

std::unique_ptr<TestFrame> BuildFrame(const FrameCase& c) {
  auto frame = std::make_unique<TestFrame>(c.width, c.height, c.colorPlanes, c.alpha, c.layout);
  Random r(c.seed ^ 0x5DEECE66DULL);
  if (c.content == Content::kPage) {
    PaintPage(*frame, c, r);
  } else {
    PaintBytes(*frame, c, r);
  }
  if (c.outputDiffers) {
    const int32_t changes = r.Between(1, 40);
    for (int32_t i = 0; i < changes; ++i) {
      const int32_t k = r.Between(0, frame->Planes() - 1);
      frame->Output().Pixel(r.Between(0, c.width - 1), r.Between(0, c.height - 1))[k] =
          static_cast<uint8_t>(r.Between(0, 255));
    }
  }
  Project::FrameView& view = frame->View();
  view.imageMode = c.imageMode;
  view.filterCase = c.filterCase;
  return frame;
}

uint64_t CaseSeed(const char* group, int32_t index) {
  if (const char* replay = std::getenv("FRINGE_EQUALITY_SEED")) {
    return std::strtoull(replay, nullptr, 10);
  }
  uint64_t h = 1469598103934665603ULL;
  for (const char* p = group; *p != '\0'; ++p)
    h = (h ^ static_cast<uint8_t>(*p)) * 1099511628211ULL;
  Random r(h + static_cast<uint64_t>(index));
  return r.Next();
}

int32_t CaseCount(int32_t usual) {
  if (std::getenv("FRINGE_EQUALITY_SEED") != nullptr) return 1;
  if (const char* count = std::getenv("FRINGE_EQUALITY_CASES")) return std::atoi(count);
  return usual;
}

}  // namespace AnalysisTest
