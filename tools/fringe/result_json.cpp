// JSON form of page results and page settings.
#include "result_json.h"

#include <stdexcept>

namespace Fringe {

namespace {

const char* StatusName(PageStatus s) {
  switch (s) {
    case PageStatus::Found:
      return "found";
    case PageStatus::NotFound:
      return "not_found";
    case PageStatus::Error:
      return "error";
  }
  return "error";
}

PageStatus StatusFromName(const std::string& s) {
  if (s == "found") return PageStatus::Found;
  if (s == "not_found") return PageStatus::NotFound;
  if (s == "error") return PageStatus::Error;
  throw std::runtime_error("unknown status \"" + s + "\"");
}

ErrorKind KindFromName(const std::string& s) {
  if (s == "bad_input") return ErrorKind::BadInput;
  if (s == "output") return ErrorKind::Output;
  if (s == "internal") return ErrorKind::Internal;
  throw std::runtime_error("unknown error kind \"" + s + "\"");
}

}  // namespace

nlohmann::ordered_json ToJson(const PageResult& r) {
  nlohmann::ordered_json j;
  j["file"] = r.file;
  j["status"] = StatusName(r.status);
  if (r.status == PageStatus::Error) {
    j["error"] = r.error;
    j["error_kind"] = ErrorKindName(r.errorKind);
  }
  if (r.width > 0) {  // the page was decoded and the module ran
    j["width"] = r.width;
    j["height"] = r.height;
    j["mode"] = r.gray ? "gray" : "rgb";
    j["alpha"] = r.alpha;
    j["format"] = r.format;
    j["confidence"] = r.answer.confidence;
    // nlohmann writes the shortest text that reads back to the same double.
    j["angle"] = r.answer.angle;
    nlohmann::ordered_json corners = nlohmann::ordered_json::array();
    for (const Corner& c : r.answer.corners) corners.push_back({c.x, c.y});
    j["corners"] = corners;
    if (r.answer.detectScale != 1.0) j["detect_scale"] = r.answer.detectScale;
    if (!r.outlinePath.empty()) j["outline"] = r.outlinePath;
    if (!r.photoPath.empty()) j["photo"] = r.photoPath;
    if (r.refined.present) j["refined"] = ToJson(r.refined);
    j["times_ms"] = {
        {"decode", r.times.decodeMs}, {"detect", r.times.detectMs}, {"write", r.times.writeMs}};
    if (r.refined.present) {
      j["times_ms"]["prepare"] = r.refined.prepareMs;
      j["times_ms"]["refine"] = r.refined.refineMs;
    }
  }
  return j;
}

std::string JsonLine(const PageResult& result) {
  return ToJson(result).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

std::string AsJsonText(const std::string& name) {
  const std::string text =
      nlohmann::json(name).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
  return nlohmann::json::parse(text).get<std::string>();
}

PageResult ResultFromJson(const nlohmann::json& j) {
  if (!j.is_object()) throw std::runtime_error("not a JSON object");
  PageResult r;
  r.file = j.at("file").get<std::string>();
  r.status = StatusFromName(j.at("status").get<std::string>());
  if (r.status == PageStatus::Error) {
    r.error = j.at("error").get<std::string>();
    r.errorKind = KindFromName(j.at("error_kind").get<std::string>());
  }
  if (j.contains("width")) {
    r.width = j.at("width").get<int32_t>();
    r.height = j.at("height").get<int32_t>();
    r.gray = j.at("mode").get<std::string>() == "gray";
    r.alpha = j.at("alpha").get<bool>();
    r.format = j.at("format").get<std::string>();
    r.answer.confidence = j.at("confidence").get<int32_t>();
    r.answer.found = r.answer.confidence > 0;
    r.answer.angle = j.at("angle").get<double>();
    const auto& corners = j.at("corners");
    if (!corners.is_array() || corners.size() != 4) throw std::runtime_error("corners: need 4");
    for (size_t i = 0; i < 4; ++i) {
      r.answer.corners[i] = {corners[i].at(0).get<int32_t>(), corners[i].at(1).get<int32_t>()};
    }
    r.answer.detectScale = j.value("detect_scale", 1.0);
    r.outlinePath = j.value("outline", "");
    r.photoPath = j.value("photo", "");
    const auto& t = j.at("times_ms");
    r.times = {t.at("decode").get<double>(), t.at("detect").get<double>(),
               t.at("write").get<double>()};
    if (j.contains("refined")) {
      r.refined = RefinedFromJson(j.at("refined"));
      r.refined.prepareMs = t.value("prepare", 0.0);
      r.refined.refineMs = t.value("refine", 0.0);
    }
  }
  return r;
}

nlohmann::json ToJson(const PageSettings& s) {
  return {{"outline", s.outputs.outline},
          {"photo", s.outputs.photo},
          {"output_dir", s.outputDir},
          {"outline_format", s.outlineFormat},
          {"photo_format", s.photoFormat},
          {"quality", s.quality},
          {"margin", s.margin},
          {"max_side", s.maxSide},
          {"max_pixels", s.maxPixels},
          {"refine", s.refine},
          {"picture_edge", s.pictureEdge}};
}

PageSettings SettingsFromJson(const nlohmann::json& j) {
  PageSettings s;
  s.outputs.outline = j.at("outline").get<bool>();
  s.outputs.photo = j.at("photo").get<bool>();
  s.outputDir = j.at("output_dir").get<std::string>();
  s.outlineFormat = j.at("outline_format").get<std::string>();
  s.photoFormat = j.at("photo_format").get<std::string>();
  s.quality = j.at("quality").get<int>();
  s.margin = j.at("margin").get<int>();
  s.maxSide = j.at("max_side").get<int32_t>();
  s.maxPixels = j.at("max_pixels").get<uint64_t>();
  s.refine = j.value("refine", true);
  s.pictureEdge = j.value("picture_edge", false);
  return s;
}

}  // namespace Fringe
