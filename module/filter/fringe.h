// Project::CFringe, the filter as the host sees it: no dialog, no parameters;
// it asks for the whole filter area, runs the scan analysis over it and
// publishes the photo's corners, angle and confidence as a document data
// record and as the result descriptor.
#pragma once

#include <cstdint>

#include "host/rastrix_filter.h"

namespace Project {

class CFringe : public Vireo::CRastrixFilter {
 public:
  CFringe();
  ~CFringe() override;

  const Vireo::DataRecordProcTable* DataRecordProcs() const override;
  const Vireo::HandleProcTable* HandleProcs() const override;
  void DoAbout(const Vireo::AboutRecord* record, intptr_t* dataSlot) override;
  bool DoParameters(Vireo::FilterRecord* record, intptr_t* dataSlot) override;
  bool DoPrepare() override;
  bool DoStart() override;
  bool DoContinue(Vireo::FilterRecord* record, intptr_t* dataSlot) override;
  void DoFinish(Vireo::FilterRecord* record, intptr_t* dataSlot) override;

  // The host result of the current run as the filter sees it: 0, the advance
  // state's failure, -128 after a cancel, or the descriptor write's error.
  int16_t ResultCode() const { return resultCode_; }
  void SetResultCode(int16_t code) { resultCode_ = code; }

 private:
  void StartAnalysis();

  int16_t resultCode_ = 0;
};

}  // namespace Project
