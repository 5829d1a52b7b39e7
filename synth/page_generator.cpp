// Draws a synthetic scanned page: paper, optional lid shadow, an antialiased
// textured photo, sensor noise and an optional transparency plane.
#include "synth/page_generator.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <string>

#include "synth/random_field.h"

namespace Synth {
namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr int kMaxSide = 65535;

// Sine and cosine from a fixed series of basic operations: the platform's
// mathematics library may differ in the last bit, and the pages must not.
void SinCosDegrees(double degrees, double& sine, double& cosine) {
  double reduced = std::fmod(degrees, 360.0);
  if (reduced > 180.0) reduced -= 360.0;
  if (reduced < -180.0) reduced += 360.0;
  const double x = reduced * (kPi / 180.0);
  const double x2 = x * x;
  double sinTerm = x;
  double cosTerm = 1.0;
  sine = 0.0;
  cosine = 0.0;
  for (int k = 1; k <= 30; ++k) {
    sine += sinTerm;
    cosine += cosTerm;
    sinTerm = -sinTerm * x2 / static_cast<double>((2 * k) * (2 * k + 1));
    cosTerm = -cosTerm * x2 / static_cast<double>((2 * k - 1) * (2 * k));
  }
}

uint8_t ToByte(double value) {
  return static_cast<uint8_t>(std::clamp(value, 0.0, 255.0) + 0.5);
}

// The photo's look: a light-to-dark gradient with large light and dark
// patches, fine detail and slow colour drift, in its own (turned) frame.
// Kept between 25 and 170 so that its outline stands well clear of the paper.
class PhotoTexture {
 public:
  PhotoTexture(const PhotoRecipe& photo, Random& random)
      : height_(photo.height),
        light_(photo.width, photo.height, 57.0, random),
        hues_{ValueNoise(photo.width, photo.height, 97.0, random),
              ValueNoise(photo.width, photo.height, 89.0, random),
              ValueNoise(photo.width, photo.height, 101.0, random)},
        detail_(photo.width, photo.height, 7.0, random) {}

  // u, v: position inside the photo, from its top-left corner.
  void Sample(double u, double v, double* rgb) const {
    const double light =
        140.0 - 65.0 * (v / height_) + 40.0 * light_.At(u, v) + 12.0 * detail_.At(u, v);
    static constexpr double kTint[3] = {8.0, 0.0, -10.0};
    for (int k = 0; k < 3; ++k) {
      rgb[k] = std::clamp(light + kTint[k] + 18.0 * hues_[k].At(u, v), 25.0, 170.0);
    }
  }

 private:
  double height_;
  ValueNoise light_;
  ValueNoise hues_[3];
  ValueNoise detail_;
};

struct Placement {
  double cx, cy, halfWidth, halfHeight, sine, cosine;
  int x0, y0, x1, y1;  // pixel bounds that may be touched, x1 and y1 exclusive
};

Placement Place(const PhotoRecipe& photo, int width, int height) {
  Placement p{};
  p.cx = photo.centerX;
  p.cy = photo.centerY;
  p.halfWidth = photo.width * 0.5;
  p.halfHeight = photo.height * 0.5;
  SinCosDegrees(photo.angleDegrees, p.sine, p.cosine);
  const double reachX = std::abs(p.cosine) * p.halfWidth + std::abs(p.sine) * p.halfHeight + 2.0;
  const double reachY = std::abs(p.sine) * p.halfWidth + std::abs(p.cosine) * p.halfHeight + 2.0;
  p.x0 = static_cast<int>(std::clamp(std::floor(p.cx - reachX), 0.0, double(width)));
  p.x1 = static_cast<int>(std::clamp(std::ceil(p.cx + reachX), 0.0, double(width)));
  p.y0 = static_cast<int>(std::clamp(std::floor(p.cy - reachY), 0.0, double(height)));
  p.y1 = static_cast<int>(std::clamp(std::ceil(p.cy + reachY), 0.0, double(height)));
  return p;
}

void Validate(const PageRecipe& recipe) {
  if (recipe.width < 1 || recipe.height < 1 || recipe.width > kMaxSide ||
      recipe.height > kMaxSide) {
    throw std::invalid_argument(
        "synthetic page size out of range: " + std::to_string(recipe.width) + " x " +
        std::to_string(recipe.height));
  }
  if (recipe.photo) {
    const PhotoRecipe& p = *recipe.photo;
    const double values[] = {p.centerX, p.centerY, p.width, p.height, p.angleDegrees};
    for (double v : values) {
      if (!std::isfinite(v)) throw std::invalid_argument("synthetic photo has a non-finite value");
    }
    if (p.width <= 0.0 || p.height <= 0.0) {
      throw std::invalid_argument("synthetic photo needs a positive width and height");
    }
  }
  if (!(recipe.noise >= 0.0) || !std::isfinite(recipe.noise)) {
    throw std::invalid_argument("synthetic page noise must be finite and not negative");
  }
}

}  // namespace

std::array<std::array<double, 2>, 4> PhotoCorners(const PhotoRecipe& photo) {
  double sine = 0.0;
  double cosine = 0.0;
  SinCosDegrees(photo.angleDegrees, sine, cosine);
  const double hw = photo.width * 0.5;
  const double hh = photo.height * 0.5;
  // Local corners, clockwise from top-left, turned counter-clockwise on
  // screen: x = u cos + v sin, y = -u sin + v cos.
  const double local[4][2] = {{-hw, -hh}, {hw, -hh}, {hw, hh}, {-hw, hh}};
  std::array<std::array<double, 2>, 4> corners{};
  for (int k = 0; k < 4; ++k) {
    const double u = local[k][0];
    const double v = local[k][1];
    corners[k] = {photo.centerX + (u * cosine + v * sine), photo.centerY + (v * cosine - u * sine)};
  }
  return corners;
}

Page GeneratePage(const PageRecipe& recipe) {
  Validate(recipe);
  const int colorChannels = recipe.color ? 3 : 1;
  Page page;
  page.width = recipe.width;
  page.height = recipe.height;
  page.channels = colorChannels + (recipe.alpha ? 1 : 0);
  page.pixels.resize(static_cast<std::size_t>(page.width) * static_cast<std::size_t>(page.height) *
                     static_cast<std::size_t>(page.channels));
  const double w = page.width;
  const double h = page.height;
  page.corners = {{{0.0, 0.0}, {w, 0.0}, {w, h}, {0.0, h}}};

  Random random(0x5EEDF00DULL ^ (static_cast<uint64_t>(recipe.seed) << 20U));
  const ValueNoise paperBroad(w, h, 83.0, random);
  const ValueNoise paperGrain(w, h, 3.0, random);
  static constexpr double kPaperRgb[3] = {240.0, 237.0, 229.0};
  static constexpr double kPaperGray = 236.0;

  std::optional<PhotoTexture> texture;
  Placement place{};
  if (recipe.photo) {
    page.corners = PhotoCorners(*recipe.photo);
    texture.emplace(*recipe.photo, random);
    place = Place(*recipe.photo, page.width, page.height);
  }
  Random noise(random.Next());

  double photoRgb[3] = {0.0, 0.0, 0.0};
  std::vector<double> broadRow(static_cast<std::size_t>(page.width));
  std::vector<double> grainRow(static_cast<std::size_t>(page.width));
  for (int y = 0; y < page.height; ++y) {
    const double py = y + 0.5;
    paperBroad.FillRow(py, page.width, broadRow.data());
    paperGrain.FillRow(py, page.width, grainRow.data());
    // Light falls off toward the hinge: a soft band along the top edge.
    double shade = 1.0;
    if (recipe.lidShadow) {
      const double t = py / 45.0;
      shade = 1.0 - 0.32 / (1.0 + t * t);
    }
    const bool rowHasPhoto = texture && y >= place.y0 && y < place.y1;
    uint8_t* out = page.pixels.data() + static_cast<std::size_t>(y) *
                                            static_cast<std::size_t>(page.width) *
                                            static_cast<std::size_t>(page.channels);
    for (int x = 0; x < page.width; ++x) {
      const double px = x + 0.5;
      const double paper = 4.0 * broadRow[x] + 2.0 * grainRow[x];
      double coverage = 0.0;
      if (rowHasPhoto && x >= place.x0 && x < place.x1) {
        const double dx = px - place.cx;
        const double dy = py - place.cy;
        const double u = dx * place.cosine - dy * place.sine;
        const double v = dx * place.sine + dy * place.cosine;
        // Area coverage of the pixel, separably along the photo's axes.
        const double cu = std::clamp(place.halfWidth + 0.5 - std::abs(u), 0.0, 1.0);
        const double cv = std::clamp(place.halfHeight + 0.5 - std::abs(v), 0.0, 1.0);
        coverage = cu * cv;
        if (coverage > 0.0) texture->Sample(u + place.halfWidth, v + place.halfHeight, photoRgb);
      }
      if (recipe.color) {
        for (int k = 0; k < 3; ++k) {
          const double mixed = (kPaperRgb[k] + paper) * (1.0 - coverage) + photoRgb[k] * coverage;
          out[k] = ToByte(mixed * shade + recipe.noise * noise.Bell());
        }
      } else {
        const double photoGray = (photoRgb[0] * 0.3 + photoRgb[1] * 0.59) + photoRgb[2] * 0.11;
        const double mixed = (kPaperGray + paper) * (1.0 - coverage) + photoGray * coverage;
        out[0] = ToByte(mixed * shade + recipe.noise * noise.Bell());
      }
      if (recipe.alpha) {
        out[colorChannels] = ToByte(recipe.pageAlpha + (255.0 - recipe.pageAlpha) * coverage);
      }
      out += page.channels;
    }
  }
  return page;
}

}  // namespace Synth
