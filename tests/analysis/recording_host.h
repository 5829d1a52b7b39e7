// A host that writes down every call in order, so that two runs can be
// compared call by call; it can cancel at a chosen abort test.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "filter/analysis/frame.h"

namespace AnalysisTest {

class RecordingHost : public Project::AnalysisHost {
 public:
  // The abort test answers true at its n-th call (1-based) and after; 0: never.
  explicit RecordingHost(int32_t cancelAt = 0) : cancelAt_(cancelAt) {}

  bool TestAbort() override;
  void ReportProgress(int32_t done, int32_t total) override;
  void SetResultCode(int16_t code) override;
  void WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) override;
  void WriteEmptyFringeRecord() override;

  // One line per call: "abort", "progress 5/100", "code -128", "record ...".
  const std::vector<std::string>& Calls() const { return calls_; }
  int32_t AbortCalls() const { return aborts_; }

 private:
  int32_t cancelAt_;
  int32_t aborts_ = 0;
  std::vector<std::string> calls_;
};

// The first line where two call logs part, or "" when they are the same.
std::string FirstDifference(const std::vector<std::string>& a, const std::vector<std::string>& b);

}  // namespace AnalysisTest
