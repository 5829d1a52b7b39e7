// The lines a coordinator and its worker processes exchange over pipes. Paths
// travel hex-encoded, so that any file name, UTF-8 or not, arrives intact.
//
//   to the worker:   {"module": hex, "settings": {...}}      once, first
//                    {"id": N, "path": hex, "display": hex, "stem": hex}
//   from the worker: {"id": N, "result": {...}}              one per job
//                    {"fatal": "reason"}                     when it cannot start
#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include "options.h"
#include "page_job.h"
#include "page_result.h"

namespace Fringe {

std::string HexEncode(const std::string& bytes);
std::string HexDecode(const std::string& hex);  // throws std::runtime_error

std::string SetupLine(const std::string& modulePath, const PageSettings& settings);
void ParseSetupLine(const std::string& line, std::string& modulePath, PageSettings& settings);

std::string JobLine(size_t id, const PageTask& task);
std::pair<size_t, PageTask> ParseJobLine(const std::string& line);

std::string ReplyLine(size_t id, const PageResult& result);
std::string FatalLine(const std::string& reason);

// A worker's reply: either a page result or a reason it cannot go on.
struct Reply {
  std::optional<size_t> id;
  PageResult result;
  std::string fatal;
};
Reply ParseReplyLine(const std::string& line);  // throws std::runtime_error

}  // namespace Fringe
