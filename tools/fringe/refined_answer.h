// The refined outline of a page as the tool reports it: the paper's edge
// found again in the page after the module's answer, the picture inside a
// white margin, a measure of fit per side and the preparations made for the
// module. Plain data, so that it travels as JSON between worker processes.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

namespace Fringe {

// (x, y) in the file's stored pixels with pixel centres at whole numbers, so
// an edge running between two pixels lies at .5.
struct OutlinePoint {
  double x = 0.0;
  double y = 0.0;
  bool operator==(const OutlinePoint&) const = default;
};

struct RefinedSide {
  std::string status;     // refined, coarse, page-edge, inferred, kept
  double rms = 0.0;       // spread of the edge positions about the fitted line, px
  double support = 0.0;   // share of positions along the side that agree with it
  double contrast = 0.0;  // step across the edge, gray levels
  bool band = false;      // a lid shadow band lies outside it
  bool margin = false;    // a white margin lies inside it
  std::string note;
  bool operator==(const RefinedSide&) const = default;
};

struct PagePreparation {
  std::string kind;  // bed-strip, smooth-noise, level-lid
  std::string detail;
  bool operator==(const PagePreparation&) const = default;
};

struct RefinedAnswer {
  bool present = false;  // refinement ran on this page
  std::string status;    // refined, partial, kept, no-photo
  std::string reason;
  bool found = false;                     // the refined answer reports a photo
  std::array<OutlinePoint, 4> outline{};  // the paper's edge, clockwise from top-left
  double angle = 0.0;                     // degrees, the module's sign
  std::array<RefinedSide, 4> sides{};     // top, right, bottom, left
  bool margin = false;                    // a white paper margin was found
  std::array<OutlinePoint, 4> picture{};  // the picture inside it (the outline without one)
  std::vector<PagePreparation> preparations;
  std::optional<std::array<int32_t, 4>>
      filterRect;              // the prepared run's (top, left, bottom, right)
  bool preparedFound = false;  // the module's answer on the prepared page, when it ran again
  std::array<std::array<int32_t, 2>, 4> preparedCorners{};
  double preparedAngle = 0.0;
  int32_t preparedConfidence = 0;
  double prepareMs = 0.0;
  double refineMs = 0.0;
  bool operator==(const RefinedAnswer&) const = default;
};

nlohmann::ordered_json ToJson(const RefinedAnswer& refined);

// Throws std::runtime_error when the object is not a refined answer.
RefinedAnswer RefinedFromJson(const nlohmann::json& j);

}  // namespace Fringe
