// Points FRINGE_ALERT_LOG at a fresh file and reads it back.
#include "alert_log.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <stdexcept>

namespace HostFake {
namespace {

void SetVariable(const char* name, const std::string& value) {
#ifdef _WIN32
  _putenv_s(name, value.c_str());
#else
  if (value.empty()) {
    unsetenv(name);
  } else {
    setenv(name, value.c_str(), 1);
  }
#endif
}

int g_counter = 0;

}  // namespace

ScopedAlertLog::ScopedAlertLog() {
  const auto directory = std::filesystem::temp_directory_path();
  // Tests run side by side in separate processes: the name must not collide.
  std::random_device entropy;
  path_ = (directory / ("fringe-alerts-" + std::to_string(entropy()) + "-" +
                        std::to_string(++g_counter) + ".log"))
              .string();
  std::remove(path_.c_str());
  SetVariable("FRINGE_ALERT_LOG", path_);
}

ScopedAlertLog::~ScopedAlertLog() {
  SetVariable("FRINGE_ALERT_LOG", "");
  std::remove(path_.c_str());
}

std::vector<std::string> ScopedAlertLog::Lines() const {
  std::vector<std::string> lines;
  std::ifstream in(path_, std::ios::binary);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

}  // namespace HostFake
