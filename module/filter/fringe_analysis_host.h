// The host's side as the analysis sees it, over the filter object: the
// record's abort test and progress procedure, the filter's result code, and
// the result record.
#pragma once

#include "filter/analysis/frame.h"

namespace Project {

class CFringe;

class FringeAnalysisHost final : public AnalysisHost {
 public:
  explicit FringeAnalysisHost(CFringe& filter) : filter_(filter) {}

  bool TestAbort() override;
  void ReportProgress(int32_t done, int32_t total) override;
  void SetResultCode(int16_t code) override;
  void WriteFringeRecord(const CornerQuad& corners, int16_t confidence) override;
  void WriteEmptyFringeRecord() override;

 private:
  CFringe& filter_;
};

}  // namespace Project
