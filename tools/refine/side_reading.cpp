// Walks a side's aligned profile from the outside in: the lid, perhaps its
// shadow, then the paper (perhaps a white margin, then the picture).
#include "refine/side_reading.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

namespace Refine {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

struct Candidate {
  double k = 0.0;         // sub-pixel index of the steepest point
  double strength = 0.0;  // |gradient| there, gray levels per index
  int polarity = 0;       // sign of the gradient: +1 brighter outward
};

// Statistics over index ranges of a NaN-marked series.
class Series {
 public:
  explicit Series(const std::vector<double>& v) : v_(v) {}

  double Mean(double from, double to) const {
    double sum = 0.0;
    int n = 0, total = 0;
    for (int k = Lo(from); k <= Hi(to); ++k, ++total) {
      const double x = v_[static_cast<size_t>(k)];
      if (std::isnan(x)) continue;
      sum += x;
      ++n;
    }
    return (n > 0 && 2 * n >= total) ? sum / n : kNaN;
  }

  double Median(double from, double to) const {
    std::vector<double> xs;
    int total = 0;
    for (int k = Lo(from); k <= Hi(to); ++k, ++total) {
      const double x = v_[static_cast<size_t>(k)];
      if (!std::isnan(x)) xs.push_back(x);
    }
    if (xs.empty() || 2 * static_cast<int>(xs.size()) < total) return kNaN;
    std::nth_element(xs.begin(), xs.begin() + static_cast<std::ptrdiff_t>(xs.size() / 2), xs.end());
    return xs[xs.size() / 2];
  }

  double Max(double from, double to) const {
    double m = kNaN;
    for (int k = Lo(from); k <= Hi(to); ++k) {
      const double x = v_[static_cast<size_t>(k)];
      if (!std::isnan(x) && !(x <= m)) m = x;
    }
    return m;
  }

  int Size() const { return static_cast<int>(v_.size()); }

 private:
  int Lo(double from) const { return std::max(0, static_cast<int>(std::ceil(from))); }
  int Hi(double to) const { return std::min(Size() - 1, static_cast<int>(std::floor(to))); }
  const std::vector<double>& v_;
};

class Reader {
 public:
  Reader(const AlignedProfile& profile, const ReadOptions& options)
      : p_(profile), options_(options), mean_(profile.mean), roughSeries_(rough_) {
    const int n = profile.Size();
    // Gradient (per index) with a light [1 2 1] smoothing.
    std::vector<double> raw(static_cast<size_t>(n), kNaN);
    for (int k = 1; k + 1 < n; ++k)
      raw[static_cast<size_t>(k)] = 0.5 * (profile.mean[static_cast<size_t>(k + 1)] -
                                           profile.mean[static_cast<size_t>(k - 1)]);
    grad_.assign(static_cast<size_t>(n), kNaN);
    for (int k = 1; k + 1 < n; ++k)
      grad_[static_cast<size_t>(k)] = 0.25 * raw[static_cast<size_t>(k - 1)] +
                                      0.5 * raw[static_cast<size_t>(k)] +
                                      0.25 * raw[static_cast<size_t>(k + 1)];
    rough_.assign(static_cast<size_t>(n), kNaN);
    for (int k = 1; k + 1 < n; ++k) {
      double s = 0.0;
      int c = 0;
      for (int m = -1; m <= 1; ++m) {
        const double r = profile.roughness[static_cast<size_t>(k + m)];
        if (!std::isnan(r)) {
          s += r;
          ++c;
        }
      }
      if (c == 3) rough_[static_cast<size_t>(k)] = s / c;
    }
    calm_ = options.pageNoise > 0.0 ? options.pageNoise : profile.noise;
    // A median of n values scatters about 1.25 sigma / sqrt(n).
    const double meanNoise = 1.25 * calm_ / std::sqrt(std::max(1, profile.lines));
    gradThreshold_ = std::max(0.6, 3.0 * meanNoise);
    stepThreshold_ = std::max(1.5, 8.0 * meanNoise);
    FindLid();
    FindCandidates();
  }

  SideReading Read() {
    SideReading r;
    r.slope = p_.slope;
    r.tCentre = p_.tCentre;
    r.lid = lid_;
    r.expectedLid = options_.expectedLid;
    r.noise = calm_;
    if (std::isnan(lid_)) {
      r.note = "no lid in reach";
      return PageEdgeOr(r);
    }

    // The outermost step with something other than lid inside and a calm
    // page outside: the paper's edge or the outer side of a shadow band.
    const Candidate* outer = nullptr;
    for (const Candidate& c : candidates_) {
      if (!Smooth(c.k + 2.0, c.k + 7.0)) continue;  // not the page outside
      // A step between two levels; dust and lid texture wiggle about one.
      const double inside = mean_.Mean(c.k - 7.0, c.k - 2.0);
      const double outside = mean_.Mean(c.k + 2.0, c.k + 7.0);
      if (std::isnan(inside) || std::isnan(outside) || std::abs(inside - outside) < stepThreshold_)
        continue;
      // Beyond the paper the lid comes back within a shadow's length; a pale
      // stretch of picture does not reach the lid's level.
      if (options_.expectedLid > 0.0) {
        const double brightest = mean_.Max(c.k + 2.0, c.k + 40.0);
        if (std::isnan(brightest) || brightest < options_.expectedLid - options_.lidTolerance)
          continue;
      }
      outer = &c;
      break;
    }
    Candidate textureEnd;
    if (outer == nullptr && TextureEnd(textureEnd)) {
      outer = &textureEnd;
      r.note = "paper edge where the picture's texture ends";
    }
    if (outer == nullptr) {
      r.note = "no step with the lid outside";
      return PageEdgeOr(r);
    }

    Candidate edge = *outer;
    if (outer->polarity > 0) {
      // Darker inside: the picture itself, or a shadow band before the paper.
      const Candidate* inner = nullptr;
      for (const Candidate& c : candidates_) {
        if (c.k >= outer->k - 2.5 || c.k < outer->k - options_.maxBandWidth) continue;
        if (IsBand(c.k, outer->k)) {
          inner = &c;
          break;
        }
      }
      if (inner != nullptr) {
        r.band = true;
        r.bandWidth = (outer->k - inner->k) * p_.sStep;
        edge = *inner;
        r.note = "paper edge inside a shadow band";
      } else {
        r.note = "paper darker than the lid";
      }
    } else {
      r.note = "paper brighter than the lid";
    }

    r.found = true;
    r.offset = p_.OffsetOf(edge.k);
    r.polarity = edge.polarity;
    r.gradient = edge.strength;
    const double inside = mean_.Mean(edge.k - 6.0, edge.k - 2.0);
    const double outside = mean_.Mean(edge.k + 2.0, edge.k + 4.0);
    r.contrast = std::abs(outside - inside);

    if (options_.maxMarginWidth > 0.0) FindMargin(edge, r);
    return r;
  }

 private:
  void FindLid() {
    // The lid: the calm part of the outer two thirds, whatever its level.
    const int n = p_.Size();
    std::vector<double> levels;
    for (int k = n / 3; k < n; ++k) {
      const double m = p_.mean[static_cast<size_t>(k)];
      const double r = rough_[static_cast<size_t>(k)];
      if (!std::isnan(m) && !std::isnan(r) && r <= CalmLimit()) levels.push_back(m);
    }
    if (levels.size() < 6) {
      lid_ = kNaN;
      return;
    }
    std::nth_element(levels.begin(),
                     levels.begin() + static_cast<std::ptrdiff_t>(levels.size() / 2), levels.end());
    lid_ = levels[levels.size() / 2];
  }

  void FindCandidates() {
    const int n = p_.Size();
    for (int k = 2; k + 2 < n; ++k) {
      const double g = grad_[static_cast<size_t>(k)];
      if (std::isnan(g) || std::abs(g) < gradThreshold_) continue;
      const double a = std::abs(grad_[static_cast<size_t>(k - 1)]);
      const double c = std::abs(grad_[static_cast<size_t>(k + 1)]);
      const double b = std::abs(g);
      if (std::isnan(a) || std::isnan(c) || b < a || b <= c) continue;
      // A step stands out from the slope on at least one side of it; a
      // ramp's wiggles have the same slope on both.
      if (b < 1.6 * std::min(FlankSlope(k + 3, k + 8, 0), FlankSlope(k - 8, k - 3, 0))) continue;
      // Nor is it a step when the page keeps sloping the same way inside it:
      // that is a shadow ramp running on toward the paper.
      const int polarity = g > 0.0 ? 1 : -1;
      if (FlankSlope(k - 8, k - 3, polarity) >= 0.5 * b) continue;
      double shift = 0.0;
      const double denom = a - 2.0 * b + c;
      if (denom < 0.0) shift = std::clamp(0.5 * (a - c) / denom, -0.5, 0.5);
      candidates_.push_back({k + shift, b, g > 0.0 ? 1 : -1});
    }
    // Outermost first.
    std::sort(candidates_.begin(), candidates_.end(),
              [](const Candidate& x, const Candidate& y) { return x.k > y.k; });
  }

  // Median gradient over an index range (0 outside the profile): its size
  // when polarity is 0, else its part in the polarity's direction.
  double FlankSlope(int from, int to, int polarity) const {
    std::vector<double> v;
    for (int k = std::max(from, 0); k <= std::min(to, p_.Size() - 1); ++k) {
      const double g = grad_[static_cast<size_t>(k)];
      if (!std::isnan(g)) v.push_back(polarity == 0 ? std::abs(g) : polarity * g);
    }
    if (v.empty()) return 0.0;
    std::nth_element(v.begin(), v.begin() + static_cast<std::ptrdiff_t>(v.size() / 2), v.end());
    return v[v.size() / 2];
  }

  // Where the picture's texture ends and a calm page begins that reaches the
  // lid: the paper's edge when no clean step marks it (a soft shadow ramp).
  bool TextureEnd(Candidate& edge) const {
    const int n = p_.Size();
    for (int k = n - 8; k >= 8; --k) {
      if (!Smooth(k + 1.0, k + 6.0) || Smooth(k - 6.0, k - 1.0)) continue;
      if (options_.expectedLid > 0.0) {
        const double brightest = mean_.Max(k + 1.0, k + 40.0);
        if (std::isnan(brightest) || brightest < options_.expectedLid - options_.lidTolerance)
          continue;
      }
      int best = k;
      for (int j = k - 3; j <= k + 3; ++j) {
        const double g = grad_[static_cast<size_t>(j)];
        if (!std::isnan(g) && std::abs(g) > std::abs(grad_[static_cast<size_t>(best)])) best = j;
      }
      const double g = grad_[static_cast<size_t>(best)];
      if (std::isnan(g) || std::abs(g) < gradThreshold_) return false;
      edge = {static_cast<double>(best), std::abs(g), g > 0.0 ? 1 : -1};
      return true;
    }
    return false;
  }

  double CalmLimit() const { return 1.6 * calm_ + 2.0; }

  bool Smooth(double from, double to) const {
    const double r = roughSeries_.Median(from, to);
    return !std::isnan(r) && r <= CalmLimit();
  }

  // A calm stretch between two steps, darker than the lid, and something
  // different inside it.
  bool IsBand(double innerK, double outerK) const {
    // Calm, or at least far calmer than the picture inside it (a compressed
    // page rings inside a narrow band). Raw roughness: smoothing would spread
    // the two steps' roughness over a narrow band.
    const Series raw(p_.roughness);
    const double bandRough = raw.Median(innerK + 1.0, outerK - 1.0);
    const double insideRough = roughSeries_.Median(innerK - 8.0, innerK - 2.0);
    if (std::isnan(bandRough)) return false;
    const bool calm =
        bandRough <= CalmLimit() || (bandRough <= 1.6 * CalmLimit() && !std::isnan(insideRough) &&
                                     bandRough <= 0.6 * insideRough);
    if (!calm) return false;
    const double level = mean_.Mean(innerK + 1.0, outerK - 1.0);
    if (std::isnan(level) || level > lid_ - std::max(10.0, 0.08 * lid_)) return false;
    // Something else lies inside: another level, or a rougher page. Looked at
    // a little way in, so that a thin line in the picture, with the same
    // calm level on both sides of it, is not taken for the paper's edge.
    const double inside = mean_.Mean(innerK - 10.0, innerK - 4.0);
    const double insideFarRough = raw.Median(innerK - 10.0, innerK - 4.0);
    if (std::isnan(inside) || std::isnan(insideFarRough)) return false;
    return std::abs(inside - level) >= 8.0 ||
           insideFarRough >= std::max(CalmLimit(), 2.0 * bandRough);
  }

  void FindMargin(const Candidate& edge, SideReading& r) const {
    // A white margin: calm and bright just inside the edge, then the picture.
    const double level = mean_.Mean(edge.k - 8.0, edge.k - 2.0);
    if (std::isnan(level) || !Smooth(edge.k - 8.0, edge.k - 2.0)) return;
    if (level < std::max(lid_ - 6.0, 170.0)) return;
    r.paleInside = true;
    for (const Candidate& c : candidates_) {
      if (c.k >= edge.k - 3.0) continue;
      if (c.k < edge.k - options_.maxMarginWidth / p_.sStep) break;
      if (!Smooth(c.k + 2.0, edge.k - 2.0)) break;  // the margin ended without a step
      const double inside = mean_.Mean(c.k - 6.0, c.k - 2.0);
      if (std::isnan(inside)) break;
      if (std::abs(inside - level) >= 10.0 || !Smooth(c.k - 6.0, c.k - 2.0)) {
        r.margin = true;
        r.innerOffset = p_.OffsetOf(c.k);
        r.innerPolarity = c.polarity;
        return;
      }
    }
  }

  // When nothing outside looks like the lid: does the paper run on to where
  // the sampled area ends?
  SideReading PageEdgeOr(SideReading r) const {
    const int n = p_.Size();
    int last = -1;
    for (int k = n - 1; k >= 0; --k) {
      if (!std::isnan(p_.mean[static_cast<size_t>(k)])) {
        last = k;
        break;
      }
    }
    if (last < 0 || !p_.areaEnds) return r;  // the profile was not cut short by the page
    // Paper running off the page keeps its texture or its step from the lid
    // right up to where the page ends; the bare lid does not.
    const double level = mean_.Mean(last - 10.0, last);
    const bool calm = Smooth(last - 10.0, last);
    const double lid = options_.expectedLid > 0.0 ? options_.expectedLid : lid_;
    const double tolerance = options_.expectedLid > 0.0 ? options_.lidTolerance : stepThreshold_;
    if (std::isnan(level) || (calm && (std::isnan(lid) || std::abs(level - lid) < tolerance)))
      return r;
    r.pageEdge = true;
    r.found = true;
    r.offset = p_.OffsetOf(last);
    r.note = "paper runs off the page";
    return r;
  }

  const AlignedProfile& p_;
  ReadOptions options_;
  Series mean_;
  std::vector<double> grad_;
  std::vector<double> rough_;
  Series roughSeries_;
  double calm_ = 0.0;
  double gradThreshold_ = 0.0;
  double stepThreshold_ = 0.0;
  double lid_ = kNaN;
  std::vector<Candidate> candidates_;
};

}  // namespace

SideReading ReadSide(const AlignedProfile& profile, const ReadOptions& options) {
  if (profile.Size() < 8) {
    SideReading r;
    r.note = "profile too short";
    return r;
  }
  return Reader(profile, options).Read();
}

}  // namespace Refine
