// Temporary stand-in for the stand-in host's convenience API, so that the tool
// builds before the real library is merged. Only built with
// -DFRINGE_TOOL_FAKE_STANDIN=ON; the real header replaces it.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

namespace Standin {

class Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

class Module {
 public:
  static std::unique_ptr<Module> Load(const std::string& path, bool privateCopy = false);
  const std::string& Path() const { return path_; }

 private:
  explicit Module(std::string path) : path_(std::move(path)) {}
  std::string path_;
};

struct PageView {
  int32_t width = 0, height = 0;
  int channels = 0;
  bool alpha = false;
  const uint8_t* pixels = nullptr;
  std::ptrdiff_t rowBytes = 0;
};

struct DetectOptions {
  std::optional<std::array<int32_t, 4>> filterRect;
};

struct Detection {
  std::array<int16_t, 6> selectorResults{};
  bool recordPresent = false;
  std::array<int16_t, 9> record{};
  bool descriptorPresent = false;
  double angle = 0.0;
  int32_t confidence = 0;
  std::array<int32_t, 8> points{};
  std::string error;
};

Detection Detect(Module& module, const PageView& page, const DetectOptions& options = {});

}  // namespace Standin
