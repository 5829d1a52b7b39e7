// JSON form of the refined answer.
#include "refined_answer.h"

#include <stdexcept>

namespace Fringe {
namespace {

constexpr std::array<const char*, 4> kSideNames = {"top", "right", "bottom", "left"};

nlohmann::ordered_json Points(const std::array<OutlinePoint, 4>& points) {
  nlohmann::ordered_json a = nlohmann::ordered_json::array();
  for (const OutlinePoint& p : points) a.push_back({p.x, p.y});
  return a;
}

std::array<OutlinePoint, 4> PointsFrom(const nlohmann::json& j) {
  if (!j.is_array() || j.size() != 4) throw std::runtime_error("refined corners: need 4");
  std::array<OutlinePoint, 4> points{};
  for (size_t k = 0; k < 4; ++k) points[k] = {j[k].at(0).get<double>(), j[k].at(1).get<double>()};
  return points;
}

}  // namespace

nlohmann::ordered_json ToJson(const RefinedAnswer& r) {
  nlohmann::ordered_json j;
  j["status"] = r.status;
  j["reason"] = r.reason;
  j["found"] = r.found;
  j["corners"] = Points(r.outline);
  j["angle"] = r.angle;
  nlohmann::ordered_json sides = nlohmann::ordered_json::array();
  for (size_t k = 0; k < 4; ++k) {
    const RefinedSide& s = r.sides[k];
    sides.push_back({{"side", kSideNames[k]},
                     {"status", s.status},
                     {"rms", s.rms},
                     {"support", s.support},
                     {"contrast", s.contrast},
                     {"band", s.band},
                     {"margin", s.margin},
                     {"note", s.note}});
  }
  j["sides"] = sides;
  j["margin"] = r.margin;
  if (r.margin) j["picture"] = Points(r.picture);
  nlohmann::ordered_json preparations = nlohmann::ordered_json::array();
  for (const PagePreparation& p : r.preparations)
    preparations.push_back({{"kind", p.kind}, {"detail", p.detail}});
  j["preparations"] = preparations;
  if (!r.preparations.empty()) {
    nlohmann::ordered_json corners = nlohmann::ordered_json::array();
    for (const auto& c : r.preparedCorners) corners.push_back({c[0], c[1]});
    nlohmann::ordered_json prepared{
        {"confidence", r.preparedConfidence}, {"angle", r.preparedAngle}, {"corners", corners}};
    if (r.filterRect) prepared["filter_rect"] = *r.filterRect;
    j["prepared"] = prepared;
  }
  return j;
}

RefinedAnswer RefinedFromJson(const nlohmann::json& j) {
  if (!j.is_object()) throw std::runtime_error("refined: not a JSON object");
  RefinedAnswer r;
  r.present = true;
  r.status = j.at("status").get<std::string>();
  r.reason = j.at("reason").get<std::string>();
  r.found = j.at("found").get<bool>();
  r.outline = PointsFrom(j.at("corners"));
  r.angle = j.at("angle").get<double>();
  const auto& sides = j.at("sides");
  if (!sides.is_array() || sides.size() != 4) throw std::runtime_error("refined sides: need 4");
  for (size_t k = 0; k < 4; ++k) {
    const auto& s = sides[k];
    r.sides[k] = {s.at("status").get<std::string>(), s.at("rms").get<double>(),
                  s.at("support").get<double>(),     s.at("contrast").get<double>(),
                  s.at("band").get<bool>(),          s.at("margin").get<bool>(),
                  s.at("note").get<std::string>()};
  }
  r.margin = j.at("margin").get<bool>();
  r.picture = r.margin ? PointsFrom(j.at("picture")) : r.outline;
  for (const auto& p : j.at("preparations"))
    r.preparations.push_back({p.at("kind").get<std::string>(), p.at("detail").get<std::string>()});
  if (j.contains("prepared")) {
    const auto& p = j.at("prepared");
    r.preparedConfidence = p.at("confidence").get<int32_t>();
    r.preparedFound = r.preparedConfidence > 0;
    r.preparedAngle = p.at("angle").get<double>();
    const auto& corners = p.at("corners");
    if (!corners.is_array() || corners.size() != 4)
      throw std::runtime_error("prepared corners: need 4");
    for (size_t k = 0; k < 4; ++k)
      r.preparedCorners[k] = {corners[k].at(0).get<int32_t>(), corners[k].at(1).get<int32_t>()};
    if (p.contains("filter_rect")) r.filterRect = p.at("filter_rect").get<std::array<int32_t, 4>>();
  }
  return r;
}

}  // namespace Fringe
