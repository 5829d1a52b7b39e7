// Encoding and decoding the worker protocol's lines.
#include "worker_protocol.h"

#include <stdexcept>

#include <nlohmann/json.hpp>

#include "result_json.h"

namespace Fringe {

namespace {

std::string Dump(const nlohmann::json& j) {
  return j.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  throw std::runtime_error("bad hex digit");
}

}  // namespace

std::string HexEncode(const std::string& bytes) {
  static const char* digits = "0123456789abcdef";
  std::string out;
  out.reserve(bytes.size() * 2);
  for (unsigned char c : bytes) {
    out += digits[c >> 4];
    out += digits[c & 15];
  }
  return out;
}

std::string HexDecode(const std::string& hex) {
  if (hex.size() % 2 != 0) throw std::runtime_error("odd hex length");
  std::string out;
  out.reserve(hex.size() / 2);
  for (size_t i = 0; i < hex.size(); i += 2) {
    out += static_cast<char>(HexValue(hex[i]) * 16 + HexValue(hex[i + 1]));
  }
  return out;
}

std::string SetupLine(const std::string& modulePath, const PageSettings& settings) {
  nlohmann::json s = ToJson(settings);
  s["output_dir"] = HexEncode(settings.outputDir);
  return Dump({{"module", HexEncode(modulePath)}, {"settings", s}});
}

void ParseSetupLine(const std::string& line, std::string& modulePath, PageSettings& settings) {
  const nlohmann::json j = nlohmann::json::parse(line);
  modulePath = HexDecode(j.at("module").get<std::string>());
  settings = SettingsFromJson(j.at("settings"));
  settings.outputDir = HexDecode(settings.outputDir);
}

std::string JobLine(size_t id, const PageTask& task) {
  return Dump({{"id", id},
               {"path", HexEncode(task.path)},
               {"display", HexEncode(task.display)},
               {"stem", HexEncode(task.outStem)}});
}

std::pair<size_t, PageTask> ParseJobLine(const std::string& line) {
  const nlohmann::json j = nlohmann::json::parse(line);
  return {j.at("id").get<size_t>(), PageTask{HexDecode(j.at("path").get<std::string>()),
                                             HexDecode(j.at("display").get<std::string>()),
                                             HexDecode(j.at("stem").get<std::string>())}};
}

std::string ReplyLine(size_t id, const PageResult& result) {
  nlohmann::ordered_json j;
  j["id"] = id;
  j["result"] = ToJson(result);
  return j.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

std::string FatalLine(const std::string& reason) {
  return Dump({{"fatal", reason}});
}

Reply ParseReplyLine(const std::string& line) {
  const nlohmann::json j = nlohmann::json::parse(line);
  Reply r;
  if (j.contains("fatal")) {
    r.fatal = j.at("fatal").get<std::string>();
    return r;
  }
  r.id = j.at("id").get<size_t>();
  r.result = ResultFromJson(j.at("result"));
  return r;
}

}  // namespace Fringe
