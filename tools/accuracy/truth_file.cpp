// JSON truth files.
#include "accuracy/truth_file.h"

#include <cmath>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <stdexcept>

namespace Accuracy {

Truth ReadTruthFile(const std::string& path) {
  std::ifstream in(path);
  if (!in) throw std::runtime_error(path + ": cannot open the truth file");
  Truth truth;
  try {
    const nlohmann::json j = nlohmann::json::parse(in);
    truth.photo = j.at("photo").get<bool>();
    truth.kind = j.value("kind", std::string());
    if (j.contains("angle") && !j["angle"].is_null()) truth.angle = j["angle"].get<double>();
    if (truth.photo) {
      const auto& corners = j.at("corners");
      if (!corners.is_array() || corners.size() != 4)
        throw std::runtime_error("\"corners\" must hold four points");
      for (size_t k = 0; k < 4; ++k) {
        const auto& p = corners[k];
        if (!p.is_array() || p.size() != 2) throw std::runtime_error("a corner must be [x, y]");
        truth.corners[k] = {p[0].get<double>(), p[1].get<double>()};
        if (!std::isfinite(truth.corners[k].x) || !std::isfinite(truth.corners[k].y))
          throw std::runtime_error("a corner is not a finite number");
      }
    }
  } catch (const nlohmann::json::exception& e) {
    throw std::runtime_error(path + ": not a valid truth file: " + e.what());
  } catch (const std::runtime_error& e) {
    throw std::runtime_error(path + ": not a valid truth file: " + e.what());
  }
  return truth;
}

void WriteTruthFile(const std::string& path, const Truth& truth) {
  nlohmann::ordered_json j;
  j["photo"] = truth.photo;
  if (!truth.kind.empty()) j["kind"] = truth.kind;
  if (truth.photo) {
    nlohmann::ordered_json corners = nlohmann::ordered_json::array();
    for (const auto& c : truth.corners) corners.push_back({c.x, c.y});
    j["corners"] = corners;
    if (truth.angle) j["angle"] = *truth.angle;
  }
  j["coordinates"] = "pixel (x, y) covers [x, x+1) x [y, y+1); corners clockwise from top-left";
  std::ofstream out(path);
  out << j.dump(2) << '\n';
  if (!out) throw std::runtime_error(path + ": cannot write the truth file");
}

std::string TruthPathFor(const std::string& imagePath) {
  std::filesystem::path p(imagePath);
  p.replace_extension(".truth.json");
  return p.string();
}

}  // namespace Accuracy
