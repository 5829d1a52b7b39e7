// Points FRINGE_ALERT_LOG at a fresh file for the life of the object, so that
// alerts and beeps land there instead of on screen, and reads them back.
#pragma once

#include <string>
#include <vector>

namespace HostFake {

class ScopedAlertLog {
 public:
  ScopedAlertLog();
  ~ScopedAlertLog();
  ScopedAlertLog(const ScopedAlertLog&) = delete;
  ScopedAlertLog& operator=(const ScopedAlertLog&) = delete;

  // Every line written so far ("ALERT\t<title>\t<message>" or "BEEP").
  std::vector<std::string> Lines() const;

 private:
  std::string path_;
};

}  // namespace HostFake
