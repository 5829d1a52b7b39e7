// Diverting alerts and beeps to a log file (FRINGE_ALERT_LOG), so that tests
// see what the user would have seen, on every platform, without a window.
#pragma once

#include <string>

namespace Vireo::Platform {

// One log field: backslash, line feed, carriage return and tab are written as
// \\, \n, \r and \t so that every alert stays on one line with two tabs.
std::string EscapeAlertField(const std::string& text);

// When FRINGE_ALERT_LOG names a file, appends "ALERT\t<title>\t<message>" to
// it and returns true; otherwise returns false and the caller shows the alert.
bool DivertAlert(const std::string& title, const std::string& message);

// Likewise for a beep: appends "BEEP".
bool DivertBeep();

}  // namespace Vireo::Platform
