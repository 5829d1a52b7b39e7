// The golden and sweep page sets and their results file.
#include "page_set.h"

#include <cstring>
#include <istream>
#include <ostream>
#include <sstream>

#include "standin/error.h"

namespace Runner {

namespace {

Synth::PageRecipe Page(int width, int height, bool color, double cx, double cy, double w, double h,
                       double angle, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.color = color;
  recipe.photo = Synth::PhotoRecipe{cx, cy, w, h, angle};
  recipe.seed = seed;
  return recipe;
}

// splitmix64: a small generator whose every step is integer arithmetic.
class Draw {
 public:
  explicit Draw(uint64_t seed) : state_(seed) {}
  uint64_t Next() {
    uint64_t z = (state_ += 0x9E3779B97F4A7C15ull);
    z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ull;
    z = (z ^ (z >> 27)) * 0x94D049BB133111EBull;
    return z ^ (z >> 31);
  }
  // Uniform in [0, 1): the top 53 bits scaled by a power of two, exact everywhere.
  double Unit() { return static_cast<double>(Next() >> 11) * (1.0 / 9007199254740992.0); }
  double Between(double low, double high) { return low + (high - low) * Unit(); }
  int Between(int low, int high) {
    return low + static_cast<int>(Next() % static_cast<uint64_t>(high - low + 1));
  }
  bool Chance(int percent) { return Between(0, 99) < percent; }

 private:
  uint64_t state_;
};

std::string Hex(uint64_t value) {
  static const char* digits = "0123456789abcdef";
  std::string text(16, '0');
  for (int i = 15; i >= 0; --i, value >>= 4) text[static_cast<size_t>(i)] = digits[value & 15];
  return text;
}

}  // namespace

std::vector<Synth::PageRecipe> GoldenPages() {
  std::vector<Synth::PageRecipe> pages = {
      Page(1200, 900, true, 600, 450, 700, 500, 7.0, 11),
      Page(1200, 900, false, 520, 470, 640, 420, -12.5, 12),
      Page(1000, 800, true, 480, 390, 500, 350, 0.0, 13),
      Page(1000, 800, false, 500, 400, 420, 300, 30.0, 14),
      Page(900, 1200, true, 430, 600, 520, 700, -25.0, 15),
      Page(1200, 900, true, 250, 450, 560, 400, 2.0, 16),
      Page(600, 500, false, 300, 250, 560, 460, 1.0, 17),
      Page(320, 240, true, 160, 120, 180, 120, 15.0, 18),
      Page(2000, 1500, true, 1000, 760, 1200, 820, -8.0, 19),
  };
  Synth::PageRecipe blank;
  blank.width = 800;
  blank.height = 600;
  blank.seed = 20;
  pages.push_back(blank);
  Synth::PageRecipe alpha = Page(1200, 900, true, 610, 440, 680, 480, 3.0, 21);
  alpha.alpha = true;
  pages.push_back(alpha);
  Synth::PageRecipe shadow = Page(1000, 800, true, 500, 420, 560, 380, -4.0, 22);
  shadow.lidShadow = true;
  pages.push_back(shadow);
  return pages;
}

std::vector<Synth::PageRecipe> SweepPages(int count, uint64_t seed) {
  Draw draw(seed);
  std::vector<Synth::PageRecipe> pages;
  for (int i = 0; i < count; ++i) {
    Synth::PageRecipe recipe;
    recipe.width = draw.Between(300, 2400);
    recipe.height = draw.Between(300, 2400);
    recipe.color = draw.Chance(50);
    recipe.alpha = draw.Chance(10);
    recipe.lidShadow = draw.Chance(20);
    recipe.noise = draw.Between(0.5, 4.0);
    recipe.seed = static_cast<uint32_t>(draw.Next());
    if (draw.Chance(92)) {
      Synth::PhotoRecipe photo;
      photo.width = recipe.width * draw.Between(0.25, 0.8);
      photo.height = recipe.height * draw.Between(0.25, 0.8);
      photo.centerX = recipe.width * draw.Between(0.3, 0.7);
      photo.centerY = recipe.height * draw.Between(0.3, 0.7);
      photo.angleDegrees = draw.Between(-40.0, 40.0);
      recipe.photo = photo;
    }
    pages.push_back(recipe);
  }
  return pages;
}

uint64_t HashPixels(const std::vector<uint8_t>& pixels) {
  uint64_t hash = 0xCBF29CE484222325ull;  // FNV-1a
  for (uint8_t byte : pixels) hash = (hash ^ byte) * 0x100000001B3ull;
  return hash;
}

PageResult ResultOf(const Synth::Page& page, const Standin::Detection& detection) {
  PageResult result;
  result.pageHash = HashPixels(page.pixels);
  result.selectors = detection.selectorResults;
  result.recordPresent = detection.recordPresent;
  result.record = detection.record;
  result.descriptorPresent = detection.descriptorPresent;
  std::memcpy(&result.angleBits, &detection.angle, sizeof result.angleBits);
  result.confidence = detection.confidence;
  result.points = detection.points;
  result.failed = !detection.error.empty();
  return result;
}

std::string Describe(const PageResult& r) {
  std::ostringstream out;
  out << Hex(r.pageHash) << " sel";
  for (int16_t s : r.selectors) out << ' ' << s;
  out << " rec " << r.recordPresent;
  for (int16_t v : r.record) out << ' ' << v;
  out << " desc " << r.descriptorPresent << ' ' << Hex(r.angleBits) << ' ' << r.confidence;
  for (int32_t v : r.points) out << ' ' << v;
  out << " err " << r.failed;
  return out.str();
}

void WriteResults(std::ostream& out, const std::string& header,
                  const std::vector<PageResult>& results) {
  out << "fringe-results " << header << '\n';
  for (const PageResult& result : results) out << Describe(result) << '\n';
}

std::vector<PageResult> ReadResults(std::istream& in, std::string* header) {
  std::string line;
  if (!std::getline(in, line) || line.rfind("fringe-results ", 0) != 0) {
    throw Standin::Error("not a results file (no 'fringe-results' header)");
  }
  *header = line.substr(15);
  std::vector<PageResult> results;
  int number = 1;
  while (std::getline(in, line)) {
    ++number;
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (line.empty()) continue;
    std::istringstream fields(line);
    PageResult r;
    std::string hash, word, angle;
    fields >> hash >> word;
    bool good = word == "sel";
    for (int16_t& s : r.selectors) fields >> s;
    fields >> word >> r.recordPresent;
    good = good && word == "rec";
    for (int16_t& v : r.record) fields >> v;
    fields >> word >> r.descriptorPresent >> angle >> r.confidence;
    good = good && word == "desc";
    for (int32_t& v : r.points) fields >> v;
    fields >> word >> r.failed;
    good = good && word == "err" && !fields.fail() && hash.size() == 16 && angle.size() == 16;
    if (!good) throw Standin::Error("results file line " + std::to_string(number) + " is damaged");
    r.pageHash = std::stoull(hash, nullptr, 16);
    r.angleBits = std::stoull(angle, nullptr, 16);
    results.push_back(r);
  }
  return results;
}

std::vector<std::string> Differences(const PageResult& a, const PageResult& b) {
  std::vector<std::string> differences;
  if (a.pageHash != b.pageHash) differences.push_back("page pixels");
  if (a.selectors != b.selectors) differences.push_back("selector results");
  if (a.recordPresent != b.recordPresent || a.record != b.record) differences.push_back("record");
  if (a.descriptorPresent != b.descriptorPresent) differences.push_back("descriptor presence");
  if (a.angleBits != b.angleBits) differences.push_back("angle");
  if (a.confidence != b.confidence) differences.push_back("confidence");
  if (a.points != b.points) differences.push_back("points");
  if (a.failed != b.failed) differences.push_back("error");
  return differences;
}

}  // namespace Runner
