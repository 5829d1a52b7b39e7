// Environment and temporary files for the module's tests.
#include "support/test_environment.h"

#include <atomic>
#include <cstdlib>
#include <fstream>
#include <random>

namespace FringeTest {

void SetEnvironment(const std::string& name, const std::string& value) {
#if defined(_WIN32)
  _putenv_s(name.c_str(), value.c_str());
#else
  setenv(name.c_str(), value.c_str(), 1);
#endif
}

void ClearEnvironment(const std::string& name) {
#if defined(_WIN32)
  _putenv_s(name.c_str(), "");
#else
  unsetenv(name.c_str());
#endif
}

ScratchFolder::ScratchFolder() {
  static std::atomic<unsigned> serial{0};
  std::random_device seed;
  path_ = std::filesystem::temp_directory_path() /
          ("fringe-test-" + std::to_string(seed()) + "-" + std::to_string(serial++));
  std::filesystem::create_directories(path_);
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  std::filesystem::remove_all(path_, ignored);
}

AlertCapture::AlertCapture() : log_(folder_.Path() / "alerts.log") {
  SetEnvironment("FRINGE_ALERT_LOG", log_.string());
}

AlertCapture::~AlertCapture() {
  ClearEnvironment("FRINGE_ALERT_LOG");
}

std::vector<std::string> AlertCapture::Lines() const {
  std::vector<std::string> lines;
  std::ifstream in(log_, std::ios::binary);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

}  // namespace FringeTest
