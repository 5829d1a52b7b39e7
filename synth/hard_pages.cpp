// Draws the hard synthetic scans: lid, shadows, bed strip, dust, the paper
// with its margin and picture, and sensor noise, one row at a time.
#include "synth/hard_pages.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <string>

#include "synth/random_field.h"

namespace Synth {
namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr std::array<std::string_view, static_cast<int>(HardKind::kCount)> kKindNames = {
    "plain",       "white-border", "shadow-band", "shadow-ramp",  "sheared",
    "bed-strip",   "grey-lid",     "uneven-lid",  "low-contrast", "dark-photo",
    "heavy-noise", "jpeg",         "off-page",    "dust",         "blank"};

using Corners = std::array<std::array<double, 2>, 4>;

double Clamp01(double v) {
  return std::clamp(v, 0.0, 1.0);
}

uint8_t ToByte(double value) {
  return static_cast<uint8_t>(std::clamp(value, 0.0, 255.0) + 0.5);
}

// Uniform draws on top of the generator's random source.
class Draw {
 public:
  explicit Draw(uint64_t seed) : random_(seed) {}
  double Uniform(double lo, double hi) { return lo + (hi - lo) * (0.5 + 0.5 * random_.Signed()); }
  int Integer(int lo, int hiInclusive) {
    return lo + static_cast<int>(random_.Next() % static_cast<uint64_t>(hiInclusive - lo + 1));
  }
  bool Chance(double p) { return Uniform(0.0, 1.0) < p; }
  double Sign() { return Chance(0.5) ? 1.0 : -1.0; }
  Random& Source() { return random_; }

 private:
  Random random_;
};

// One side of a convex outline as a half-plane: inward unit normal and offset,
// plus the side's start point, direction and length for the lid's shadows.
struct HalfPlane {
  double nx = 0.0, ny = 0.0, c = 0.0;  // inside: nx * x + ny * y + c > 0
  double ax = 0.0, ay = 0.0, ux = 0.0, uy = 0.0, length = 0.0;

  double Inside(double x, double y) const { return nx * x + ny * y + c; }
  double Along(double x, double y) const { return (x - ax) * ux + (y - ay) * uy; }
};

// Sides of a clockwise-on-screen quad (y downward), inward normals.
std::array<HalfPlane, 4> HalfPlanesOf(const Corners& q) {
  std::array<HalfPlane, 4> sides{};
  for (int k = 0; k < 4; ++k) {
    const auto& a = q[k];
    const auto& b = q[(k + 1) % 4];
    const double dx = b[0] - a[0];
    const double dy = b[1] - a[1];
    const double len = std::hypot(dx, dy);
    HalfPlane& h = sides[k];
    h.ax = a[0];
    h.ay = a[1];
    h.ux = dx / len;
    h.uy = dy / len;
    h.length = len;
    // Turning the side's direction a quarter turn clockwise on screen points inward.
    h.nx = -h.uy;
    h.ny = h.ux;
    h.c = -(h.nx * a[0] + h.ny * a[1]);
  }
  return sides;
}

// The paper's corners: the generator's rectangle, with the bottom edge slid
// along the top edge so that the left and right sides turn by the shear.
Corners PaperCorners(const HardPageRecipe& s) {
  PhotoRecipe photo{s.centerX, s.centerY, s.paperWidth, s.paperHeight, s.angleDegrees};
  Corners c = PhotoCorners(photo);
  const double shift = 0.5 * s.paperHeight * std::tan(s.shearDegrees * kPi / 180.0);
  const double ux = (c[1][0] - c[0][0]) / s.paperWidth;
  const double uy = (c[1][1] - c[0][1]) / s.paperWidth;
  for (int k = 0; k < 4; ++k) {
    const double d = k < 2 ? -shift : shift;
    c[k][0] += d * ux;
    c[k][1] += d * uy;
  }
  return c;
}

// The quad moved inward by the same distance on every side.
Corners Inset(const Corners& q, double by) {
  const auto sides = HalfPlanesOf(q);
  Corners out{};
  for (int k = 0; k < 4; ++k) {
    const HalfPlane& p = sides[(k + 3) % 4];
    const HalfPlane& n = sides[k];
    // Solve p.n . x = -(p.c) + by and n.n . x = -(n.c) + by.
    const double r1 = by - p.c;
    const double r2 = by - n.c;
    const double det = p.nx * n.ny - p.ny * n.nx;
    out[k] = {(r1 * n.ny - p.ny * r2) / det, (p.nx * r2 - r1 * n.nx) / det};
  }
  return out;
}

// The quad clipped to the page rectangle; nullopt unless the visible part is
// again a quad. Corners start at the one nearest the paper's own top-left.
std::optional<Corners> ClipToPage(const Corners& q, double width, double height,
                                  double angleDegrees) {
  std::vector<std::array<double, 2>> poly(q.begin(), q.end());
  auto clip = [&poly](auto inside, auto cross) {
    std::vector<std::array<double, 2>> out;
    for (size_t i = 0; i < poly.size(); ++i) {
      const auto& a = poly[i];
      const auto& b = poly[(i + 1) % poly.size()];
      const bool ia = inside(a);
      const bool ib = inside(b);
      if (ia) out.push_back(a);
      if (ia != ib) out.push_back(cross(a, b));
    }
    poly = std::move(out);
  };
  auto atX = [](const std::array<double, 2>& a, const std::array<double, 2>& b, double x) {
    const double t = (x - a[0]) / (b[0] - a[0]);
    return std::array<double, 2>{x, a[1] + t * (b[1] - a[1])};
  };
  auto atY = [](const std::array<double, 2>& a, const std::array<double, 2>& b, double y) {
    const double t = (y - a[1]) / (b[1] - a[1]);
    return std::array<double, 2>{a[0] + t * (b[0] - a[0]), y};
  };
  clip([](const auto& p) { return p[0] >= 0.0; },
       [&](const auto& a, const auto& b) { return atX(a, b, 0.0); });
  clip([&](const auto& p) { return p[0] <= width; },
       [&](const auto& a, const auto& b) { return atX(a, b, width); });
  clip([](const auto& p) { return p[1] >= 0.0; },
       [&](const auto& a, const auto& b) { return atY(a, b, 0.0); });
  clip([&](const auto& p) { return p[1] <= height; },
       [&](const auto& a, const auto& b) { return atY(a, b, height); });
  if (poly.size() != 4) return std::nullopt;
  const double a = angleDegrees * kPi / 180.0;
  size_t first = 0;
  double best = 0.0;
  for (size_t i = 0; i < 4; ++i) {
    // Position along the paper's own right and down directions.
    const double u = poly[i][0] * std::cos(a) - poly[i][1] * std::sin(a);
    const double v = poly[i][0] * std::sin(a) + poly[i][1] * std::cos(a);
    if (i == 0 || u + v < best) {
      best = u + v;
      first = i;
    }
  }
  Corners out{};
  for (size_t i = 0; i < 4; ++i) out[i] = poly[(first + i) % 4];
  return out;
}

// Half extents of the turned paper along x and y.
std::array<double, 2> Reach(const HardPageRecipe& s) {
  const double a = s.angleDegrees * kPi / 180.0;
  const double extra = 0.5 * s.paperHeight * std::abs(std::tan(s.shearDegrees * kPi / 180.0));
  return {std::abs(std::cos(a)) * s.paperWidth * 0.5 + std::abs(std::sin(a)) * s.paperHeight * 0.5 +
              extra,
          std::abs(std::sin(a)) * s.paperWidth * 0.5 + std::abs(std::cos(a)) * s.paperHeight * 0.5 +
              extra};
}

struct Speck {
  double x, y, radius, level;
};

// The picture's tones at a point in its own frame.
class Picture {
 public:
  Picture(const HardPageRecipe& s, double width, double height, Draw& draw)
      : recipe_(s),
        width_(width),
        height_(height),
        broad_(width, height, 90.0, draw.Source()),
        blobs_{ValueNoise(width, height, 47.0, draw.Source()),
               ValueNoise(width, height, 39.0, draw.Source()),
               ValueNoise(width, height, 55.0, draw.Source())},
        detail_(width, height, 5.0, draw.Source()),
        horizon_(draw.Uniform(0.25, 0.6) * height),
        horizonTilt_(draw.Uniform(-0.03, 0.03)),
        lineSide_(draw.Integer(0, 3)),
        lineDepth_(draw.Uniform(12.0, 40.0)) {}

  // u, v from the picture's top-left corner along its own axes.
  void Sample(double u, double v, double* rgb) const {
    double t = 0.5 + 0.28 * broad_.At(u, v) + 0.07 * detail_.At(u, v);
    const double fromHorizon = v - (horizon_ + horizonTilt_ * (u - 0.5 * width_));
    t += 0.14 * std::tanh(-fromHorizon / 2.0);
    if (recipe_.innerLine) {
      const double depth = lineSide_ == 0   ? v
                           : lineSide_ == 1 ? width_ - u
                           : lineSide_ == 2 ? height_ - v
                                            : u;
      if (std::abs(depth - lineDepth_) < 1.5) t -= 0.45;
    }
    static constexpr double kTint[3] = {0.03, 0.0, -0.04};
    for (int k = 0; k < 3; ++k) {
      const double tk = Clamp01(t + 0.13 * blobs_[k].At(u, v) + kTint[k]);
      rgb[k] = Tone(tk);
    }
  }

 private:
  double Tone(double t) const {
    switch (recipe_.tone) {
      case PictureTone::kFaded:
        return recipe_.lidLevel - 62.0 + 55.0 * t;
      case PictureTone::kSnowy: {
        const double dark = 1.0 - t;
        return recipe_.lidLevel - 3.0 - 160.0 * dark * dark * dark;
      }
      case PictureTone::kDark:
        return 4.0 + 70.0 * t;
      case PictureTone::kNormal:
        break;
    }
    return 18.0 + 205.0 * t;
  }

  HardPageRecipe recipe_;
  double width_, height_;
  ValueNoise broad_;
  ValueNoise blobs_[3];
  ValueNoise detail_;
  double horizon_, horizonTilt_;
  int lineSide_;
  double lineDepth_;
};

void Validate(const HardPageRecipe& s) {
  if (s.width < 32 || s.height < 32 || s.width > 32767 || s.height > 32767)
    throw std::invalid_argument("hard page size out of range: " + std::to_string(s.width) + " x " +
                                std::to_string(s.height));
  const double values[] = {s.centerX,      s.centerY, s.paperWidth, s.paperHeight,  s.angleDegrees,
                           s.shearDegrees, s.border,  s.noise,      s.edgeSoftness, s.lidLevel};
  for (double v : values)
    if (!std::isfinite(v)) throw std::invalid_argument("hard page recipe has a non-finite value");
  if (s.hasPhoto && (s.paperWidth < 8.0 || s.paperHeight < 8.0))
    throw std::invalid_argument("hard page paper is too small");
  if (s.hasPhoto &&
      (s.border < 0.0 || 2.0 * s.border >= std::min(s.paperWidth, s.paperHeight) - 4.0))
    throw std::invalid_argument("hard page border does not fit the paper");
  if (std::abs(s.shearDegrees) > 5.0) throw std::invalid_argument("hard page shear is too large");
  if (s.noise < 0.0 || s.edgeSoftness < 0.25)
    throw std::invalid_argument("hard page noise or softness out of range");
}

}  // namespace

std::string_view HardKindName(HardKind kind) {
  const int k = static_cast<int>(kind);
  if (k < 0 || k >= static_cast<int>(HardKind::kCount)) return "unknown";
  return kKindNames[static_cast<size_t>(k)];
}

std::optional<HardKind> HardKindFromName(std::string_view name) {
  for (size_t k = 0; k < kKindNames.size(); ++k)
    if (kKindNames[k] == name) return static_cast<HardKind>(k);
  return std::nullopt;
}

HardPageRecipe MakeHardPageRecipe(HardKind kind, uint32_t seed, int width, int height) {
  Draw draw(0xA5D1C0DEULL ^ (static_cast<uint64_t>(seed) << 17U) ^
            (static_cast<uint64_t>(static_cast<int>(kind)) << 45U));
  HardPageRecipe s;
  s.kind = kind;
  s.width = width;
  s.height = height;
  s.seed = seed;
  s.color = draw.Chance(0.7);
  s.lidLevel = draw.Uniform(236.0, 250.0);
  s.noise = draw.Uniform(1.5, 3.5);
  s.edgeSoftness = draw.Uniform(0.8, 1.6);
  s.paperWhite = std::min(253.0, s.lidLevel + draw.Uniform(2.0, 9.0));
  s.paperWidth = draw.Uniform(0.35, 0.72) * width;
  s.paperHeight = draw.Uniform(0.35, 0.72) * height;
  s.angleDegrees = draw.Chance(0.8) ? draw.Uniform(-6.0, 6.0) : draw.Uniform(-20.0, 20.0);
  s.innerLine = draw.Chance(0.2);

  auto band = [&draw](SideShadow& side) {
    side.bandWidth = draw.Uniform(4.0, 9.0);
    side.bandDepth = draw.Uniform(0.25, 0.6);
  };
  auto ramp = [&draw](SideShadow& side) {
    side.rampLength = draw.Uniform(4.0, 15.0);
    side.rampDepth = draw.Uniform(0.2, 0.45);
  };
  const int first = draw.Integer(0, 3);
  double keepClear = 40.0;  // px between the paper and the page edge

  switch (kind) {
    case HardKind::kPlain:
      break;
    case HardKind::kWhiteBorder:
      s.border = std::max(12.0, draw.Uniform(0.025, 0.07) * std::min(s.paperWidth, s.paperHeight));
      if (draw.Chance(0.6)) band(s.shadows[static_cast<size_t>(first)]);
      if (draw.Chance(0.3)) band(s.shadows[static_cast<size_t>((first + 1) % 4)]);
      break;
    case HardKind::kShadowBand:
      band(s.shadows[static_cast<size_t>(first)]);
      if (draw.Chance(0.6)) band(s.shadows[static_cast<size_t>((first + 1) % 4)]);
      if (draw.Chance(0.5)) ramp(s.shadows[static_cast<size_t>((first + 2) % 4)]);
      break;
    case HardKind::kShadowRamp:
      ramp(s.shadows[static_cast<size_t>(first)]);
      if (draw.Chance(0.5)) ramp(s.shadows[static_cast<size_t>((first + 2) % 4)]);
      if (draw.Chance(0.5)) band(s.shadows[static_cast<size_t>((first + 1) % 4)]);
      break;
    case HardKind::kSheared:
      s.shearDegrees = draw.Sign() * draw.Uniform(0.1, 0.2);
      if (draw.Chance(0.5)) band(s.shadows[static_cast<size_t>(first)]);
      break;
    case HardKind::kBedStrip:
      s.bedStripSide = first;
      s.bedStripWidth = draw.Uniform(15.0, 70.0);
      s.bedStripLevel = draw.Uniform(15.0, 60.0);
      keepClear += s.bedStripWidth;
      break;
    case HardKind::kGreyLid:
      s.lidLevel = draw.Uniform(170.0, 215.0);
      s.paperWhite = draw.Uniform(240.0, 252.0);
      break;
    case HardKind::kUnevenLid:
      s.lidUnevenness = draw.Uniform(0.08, 0.2);
      if (draw.Chance(0.5)) s.hingeShadow = draw.Uniform(0.1, 0.3);
      break;
    case HardKind::kLowContrast:
      s.tone = draw.Chance(0.5) ? PictureTone::kFaded : PictureTone::kSnowy;
      break;
    case HardKind::kDarkPhoto:
      s.tone = PictureTone::kDark;
      if (draw.Chance(0.5)) band(s.shadows[static_cast<size_t>(first)]);
      break;
    case HardKind::kHeavyNoise:
      s.noise = draw.Uniform(10.0, 22.0);
      break;
    case HardKind::kJpeg:
      s.jpegQuality = draw.Integer(35, 70);
      if (draw.Chance(0.5)) band(s.shadows[static_cast<size_t>(first)]);
      break;
    case HardKind::kOffPage:
      s.angleDegrees = draw.Uniform(-3.0, 3.0);
      break;
    case HardKind::kDust:
      s.dustSide = first;
      s.dustCount = draw.Integer(15, 40);
      s.dustDistance = draw.Uniform(15.0, 60.0);
      keepClear += s.dustDistance + 10.0;
      break;
    case HardKind::kBlank:
      s.hasPhoto = false;
      if (draw.Chance(0.5)) s.lidUnevenness = draw.Uniform(0.05, 0.2);
      if (draw.Chance(0.4)) s.hingeShadow = draw.Uniform(0.1, 0.3);
      if (draw.Chance(0.3)) s.lidLevel = draw.Uniform(170.0, 215.0);
      s.noise = draw.Uniform(1.5, 8.0);
      break;
    case HardKind::kCount:
      throw std::invalid_argument("not a hard page kind");
  }

  // Place the paper: clear of the page edges, or over one of them for kOffPage.
  const auto reach = Reach(s);
  const double spanX = width - 2.0 * (reach[0] + keepClear);
  const double spanY = height - 2.0 * (reach[1] + keepClear);
  s.centerX = width * 0.5 + (spanX > 0.0 ? draw.Uniform(-0.5, 0.5) * spanX : 0.0);
  s.centerY = height * 0.5 + (spanY > 0.0 ? draw.Uniform(-0.5, 0.5) * spanY : 0.0);
  if (kind == HardKind::kOffPage) {
    // Far enough over that the outer side lies wholly off the page.
    const double sine = std::abs(std::sin(s.angleDegrees * kPi / 180.0));
    double over = draw.Uniform(0.08, 0.25);
    if (first == 0 || first == 2)
      over = std::max(over, (s.paperWidth * sine + 10.0) / s.paperHeight);
    if (first == 1 || first == 3)
      over = std::max(over, (s.paperHeight * sine + 10.0) / s.paperWidth);
    if (first == 0) s.centerY = reach[1] - over * s.paperHeight;
    if (first == 1) s.centerX = width - reach[0] + over * s.paperWidth;
    if (first == 2) s.centerY = height - reach[1] + over * s.paperHeight;
    if (first == 3) s.centerX = reach[0] - over * s.paperWidth;
  }
  if (kind == HardKind::kDust) {
    s.dustCount = std::max(s.dustCount, 1);
  }
  return s;
}

HardPage GenerateHardPage(const HardPageRecipe& s) {
  Validate(s);
  HardPage out;
  out.recipe = s;
  out.hasPhoto = s.hasPhoto;
  Page& page = out.page;
  page.width = s.width;
  page.height = s.height;
  const int channels = s.color ? 3 : 1;
  page.channels = channels;
  page.pixels.resize(static_cast<size_t>(s.width) * static_cast<size_t>(s.height) *
                     static_cast<size_t>(channels));
  const double w = s.width;
  const double h = s.height;
  page.corners = {{{0.0, 0.0}, {w, 0.0}, {w, h}, {0.0, h}}};

  Draw draw(0x51DE5EEDULL ^ (static_cast<uint64_t>(s.seed) << 21U) ^
            (static_cast<uint64_t>(static_cast<int>(s.kind)) << 50U));
  const ValueNoise lidBroad(w, h, 260.0, draw.Source());
  const ValueNoise lidGrain(w, h, 3.0, draw.Source());
  const ValueNoise stripTexture(w, h, 9.0, draw.Source());
  const double slopeX = draw.Uniform(-1.0, 1.0);
  const double slopeY = draw.Uniform(-1.0, 1.0);

  Corners paper{};
  Corners picture{};
  std::array<HalfPlane, 4> paperSides{};
  std::array<HalfPlane, 4> pictureSides{};
  std::optional<Picture> texture;
  double cosA = 1.0, sinA = 0.0, shearTan = 0.0, maxShadow = 0.0;
  if (s.hasPhoto) {
    paper = PaperCorners(s);
    picture = s.border > 0.0 ? Inset(paper, s.border) : paper;
    paperSides = HalfPlanesOf(paper);
    pictureSides = HalfPlanesOf(picture);
    texture.emplace(s, s.paperWidth - 2.0 * s.border, s.paperHeight - 2.0 * s.border, draw);
    cosA = std::cos(s.angleDegrees * kPi / 180.0);
    sinA = std::sin(s.angleDegrees * kPi / 180.0);
    shearTan = std::tan(s.shearDegrees * kPi / 180.0);
    for (const SideShadow& side : s.shadows)
      maxShadow = std::max({maxShadow, side.bandWidth + 3.0, 6.0 * side.rampLength});
    const auto visible = ClipToPage(paper, w, h, s.angleDegrees);
    if (!visible) throw std::invalid_argument("hard page paper is not a quad on the page");
    out.paper = *visible;
    const auto visiblePicture = ClipToPage(picture, w, h, s.angleDegrees);
    out.picture = visiblePicture ? *visiblePicture : *visible;
    page.corners = out.paper;
  }

  // Dust: specks in a loose line outside one side of the paper.
  std::vector<Speck> specks;
  if (s.hasPhoto && s.dustSide >= 0 && s.dustSide < 4) {
    const HalfPlane& side = paperSides[static_cast<size_t>(s.dustSide)];
    for (int i = 0; i < s.dustCount; ++i) {
      const double along = draw.Uniform(0.02, 0.98) * side.length;
      const double outward = s.dustDistance + draw.Uniform(-6.0, 6.0);
      specks.push_back({side.ax + side.ux * along - side.nx * outward,
                        side.ay + side.uy * along - side.ny * outward, draw.Uniform(0.8, 2.5),
                        draw.Uniform(40.0, 150.0)});
    }
  } else if (!s.hasPhoto && s.kind == HardKind::kBlank && draw.Chance(0.3)) {
    for (int i = 0; i < 25; ++i)
      specks.push_back({draw.Uniform(20.0, w - 20.0), draw.Uniform(20.0, h - 20.0),
                        draw.Uniform(0.8, 2.5), draw.Uniform(40.0, 150.0)});
  }

  static constexpr double kLidTint[3] = {0.0, -2.0, -6.0};
  static constexpr double kPaperTint[3] = {0.0, -1.0, -4.0};
  Random noise(draw.Source().Next());
  std::vector<double> broadRow(static_cast<size_t>(s.width));
  std::vector<double> grainRow(static_cast<size_t>(s.width));
  std::vector<double> stripRow(static_cast<size_t>(s.width));
  double rgb[3] = {0.0, 0.0, 0.0};
  double pic[3] = {0.0, 0.0, 0.0};

  for (int y = 0; y < s.height; ++y) {
    const double py = y + 0.5;
    lidBroad.FillRow(py, s.width, broadRow.data());
    lidGrain.FillRow(py, s.width, grainRow.data());
    stripTexture.FillRow(py, s.width, stripRow.data());
    const double hinge = 1.0 - s.hingeShadow / (1.0 + (py / 45.0) * (py / 45.0));
    uint8_t* px_out = page.pixels.data() + static_cast<size_t>(y) * static_cast<size_t>(s.width) *
                                               static_cast<size_t>(channels);
    for (int x = 0; x < s.width; ++x) {
      const double px = x + 0.5;
      // The lid: level, a broad drift for uneven lids, fine grain, hinge shade.
      const double drift =
          Clamp01(0.5 + 0.25 * (slopeX * (px / w - 0.5) + slopeY * (py / h - 0.5)) +
                  0.35 * broadRow[static_cast<size_t>(x)]);
      double lid =
          s.lidLevel * (1.0 - s.lidUnevenness * drift) + 1.5 * grainRow[static_cast<size_t>(x)];
      lid *= hinge;

      double coverPaper = 0.0;
      double coverPicture = 0.0;
      if (s.hasPhoto) {
        double shade = 1.0;
        coverPaper = 1.0;
        coverPicture = 1.0;
        for (size_t k = 0; k < 4; ++k) {
          const HalfPlane& side = paperSides[k];
          const double d = side.Inside(px, py);
          coverPaper *= Clamp01(0.5 + d / s.edgeSoftness);
          if (d < 1.0 && -d < maxShadow) {
            const double along = side.Along(px, py);
            const SideShadow& sh = s.shadows[k];
            const double e = std::max(0.0, -d);
            double dark = 0.0;
            if (sh.bandWidth > 0.0 && along > -sh.bandWidth && along < side.length + sh.bandWidth)
              dark += sh.bandDepth * Clamp01((sh.bandWidth - e) / 1.2 + 0.5);
            if (sh.rampLength > 0.0 && along > 0.0 && along < side.length)
              dark += sh.rampDepth * std::exp(-e / sh.rampLength);
            shade *= 1.0 - std::min(dark, 0.9);
          }
          if (s.border > 0.0)
            coverPicture *= Clamp01(0.5 + pictureSides[k].Inside(px, py) / s.edgeSoftness);
        }
        if (s.border <= 0.0) coverPicture = coverPaper;
        lid *= shade;
      }

      // The scanner bed beyond the lid's reach along one page edge.
      double bed = 0.0;
      if (s.bedStripSide >= 0) {
        const double into = s.bedStripSide == 0   ? s.bedStripWidth - py
                            : s.bedStripSide == 1 ? px - (w - s.bedStripWidth)
                            : s.bedStripSide == 2 ? py - (h - s.bedStripWidth)
                                                  : s.bedStripWidth - px;
        bed = Clamp01(0.5 + into / 1.5);
      }
      const double bedValue = s.bedStripLevel + 6.0 * stripRow[static_cast<size_t>(x)];

      double speck = 0.0, speckLevel = 0.0;
      for (const Speck& d : specks) {
        if (std::abs(d.y - py) > d.radius + 1.0 || std::abs(d.x - px) > d.radius + 1.0) continue;
        const double c = Clamp01(d.radius + 0.5 - std::hypot(d.x - px, d.y - py));
        if (c > speck) {
          speck = c;
          speckLevel = d.level;
        }
      }

      if (coverPicture > 0.0) {
        const double dx = px - s.centerX;
        const double dy = py - s.centerY;
        double u = dx * cosA - dy * sinA;
        const double v = dx * sinA + dy * cosA;
        u -= v * shearTan;
        texture->Sample(u + 0.5 * s.paperWidth - s.border, v + 0.5 * s.paperHeight - s.border, pic);
      }
      const double paperGrain = 1.2 * grainRow[static_cast<size_t>(x)];
      for (int k = 0; k < 3; ++k) {
        double v = lid + kLidTint[k];
        v += (speckLevel - v) * speck;
        v += (bedValue - v) * bed;
        v += (s.paperWhite + kPaperTint[k] + paperGrain - v) * coverPaper;
        v += (pic[k] - v) * coverPicture;
        rgb[k] = v;
      }
      if (channels == 3) {
        for (int k = 0; k < 3; ++k) px_out[k] = ToByte(rgb[k] + s.noise * noise.Bell());
      } else {
        const double gray = (rgb[0] * 0.3 + rgb[1] * 0.59) + rgb[2] * 0.11;
        px_out[0] = ToByte(gray + s.noise * noise.Bell());
      }
      px_out += channels;
    }
  }
  return out;
}

std::vector<HardPageRecipe> HardPageSet(int count, uint32_t seed) {
  static constexpr std::array<std::array<int, 2>, 4> kSizes = {
      {{2000, 1500}, {1600, 1200}, {1500, 2000}, {2400, 1800}}};
  std::vector<HardPageRecipe> recipes;
  const int kinds = static_cast<int>(HardKind::kCount);
  for (int i = 0; i < count; ++i) {
    const auto kind = static_cast<HardKind>(i % kinds);
    const auto& size = kSizes[static_cast<size_t>((i / kinds) % static_cast<int>(kSizes.size()))];
    recipes.push_back(
        MakeHardPageRecipe(kind, seed * 7919U + static_cast<uint32_t>(i), size[0], size[1]));
  }
  return recipes;
}

}  // namespace Synth
