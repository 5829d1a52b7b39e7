// One page's result as a JSON object (a line of JSON Lines output, of the
// results file and of the worker protocol) and back.
#pragma once

#include <nlohmann/json.hpp>

#include "options.h"
#include "page_result.h"

namespace Fringe {

// Keys in a fixed, readable order: file and status first.
nlohmann::ordered_json ToJson(const PageResult& result);

// One line of JSON Lines, without the newline. Bytes of file names that are
// not UTF-8 are replaced, as JSON text must be UTF-8.
std::string JsonLine(const PageResult& result);

// A name as it reads back from a JSON line (see JsonLine).
std::string AsJsonText(const std::string& name);

// Throws std::runtime_error when the object is not a page result.
PageResult ResultFromJson(const nlohmann::json& j);

nlohmann::json ToJson(const PageSettings& settings);
PageSettings SettingsFromJson(const nlohmann::json& j);

}  // namespace Fringe
