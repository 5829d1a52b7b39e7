// The one exception type of the stand-in host: a message that names what was
// being done and why it failed.
#pragma once

#include <stdexcept>
#include <string>

namespace Standin {

class Error : public std::runtime_error {
 public:
  explicit Error(const std::string& message) : std::runtime_error(message) {}
};

}  // namespace Standin
