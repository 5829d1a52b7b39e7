// Environment and temporary files for the module's tests: alerts captured in
// a log file instead of windows, scratch folders that clean up after
// themselves, and a check that a test left no filter run behind.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace FringeTest {

void SetEnvironment(const std::string& name, const std::string& value);
void ClearEnvironment(const std::string& name);

// A fresh folder under the system's temporary folder, removed at the end.
class ScratchFolder {
 public:
  ScratchFolder();
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;
  const std::filesystem::path& Path() const { return path_; }

 private:
  std::filesystem::path path_;
};

// Sends the module's alerts and beeps to a log for the life of the object.
class AlertCapture {
 public:
  AlertCapture();
  ~AlertCapture();
  AlertCapture(const AlertCapture&) = delete;
  AlertCapture& operator=(const AlertCapture&) = delete;
  // Every line written so far: "ALERT\t<title>\t<message>" or "BEEP".
  std::vector<std::string> Lines() const;

 private:
  ScratchFolder folder_;
  std::filesystem::path log_;
};

}  // namespace FringeTest
