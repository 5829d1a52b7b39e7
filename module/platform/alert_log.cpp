// Diverting alerts and beeps to the file named by FRINGE_ALERT_LOG.
#include "platform/alert_log.h"

#include <cstdio>
#include <cstdlib>

namespace Vireo::Platform {
namespace {

bool AppendToAlertLog(const std::string& line) {
  const char* path = std::getenv("FRINGE_ALERT_LOG");
  if (path == nullptr || *path == '\0') return false;
  // Diverted even when the file cannot be written: a test run must never
  // fall back to a window that nobody can close.
  if (std::FILE* file = std::fopen(path, "ab")) {
    std::fwrite(line.data(), 1, line.size(), file);
    std::fputc('\n', file);
    std::fclose(file);
  }
  return true;
}

}  // namespace

std::string EscapeAlertField(const std::string& text) {
  std::string escaped;
  escaped.reserve(text.size());
  for (char c : text) {
    switch (c) {
      case '\\':
        escaped += "\\\\";
        break;
      case '\n':
        escaped += "\\n";
        break;
      case '\r':
        escaped += "\\r";
        break;
      case '\t':
        escaped += "\\t";
        break;
      default:
        escaped += c;
        break;
    }
  }
  return escaped;
}

bool DivertAlert(const std::string& title, const std::string& message) {
  return AppendToAlertLog("ALERT\t" + EscapeAlertField(title) + "\t" + EscapeAlertField(message));
}

bool DivertBeep() {
  return AppendToAlertLog("BEEP");
}

}  // namespace Vireo::Platform
