// RecordingHost.
#include "recording_host.h"

#include <sstream>

namespace AnalysisTest {

bool RecordingHost::TestAbort() {
  ++aborts_;
  const bool cancel = cancelAt_ > 0 && aborts_ >= cancelAt_;
  calls_.push_back(cancel ? "abort: cancel" : "abort");
  return cancel;
}

void RecordingHost::ReportProgress(int32_t done, int32_t total) {
  calls_.push_back("progress " + std::to_string(done) + "/" + std::to_string(total));
}

void RecordingHost::SetResultCode(int16_t code) {
  calls_.push_back("code " + std::to_string(code));
}

void RecordingHost::WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) {
  std::ostringstream line;
  line << "record";
  for (const Project::Point& p : corners.corner) line << " (" << p.v << "," << p.h << ")";
  line << " confidence " << confidence;
  calls_.push_back(line.str());
}

void RecordingHost::WriteEmptyFringeRecord() {
  calls_.push_back("failure record");
}

std::string FirstDifference(const std::vector<std::string>& a, const std::vector<std::string>& b) {
  for (size_t i = 0; i < a.size() || i < b.size(); ++i) {
    const std::string left = i < a.size() ? a[i] : "(none)";
    const std::string right = i < b.size() ? b[i] : "(none)";
    if (left != right) {
      return "call " + std::to_string(i) + ": module '" + left + "', literal '" + right + "'";
    }
  }
  return "";
}

}  // namespace AnalysisTest
