// The narrow view of the host's frame that the analysis reads, and the host
// services it calls back. The analysis never sees the host's record or classes:
// the filter fills a FrameView from the record and implements AnalysisHost.
#pragma once

#include <cstdint>

#include "filter/analysis/types.h"

namespace Project {

struct FrameView {
  uint16_t imageMode = 0;       // host image mode (1 grayscale, 3 RGB)
  int16_t filterCase = 0;       // 4 and 5: editable transparency
  int16_t planes = 0;           // planes delivered per pixel
  int16_t documentRows = 0;     // document size, v
  int16_t documentColumns = 0;  // document size, h

  Rect inRect;                // the frame, in document coordinates
  uint8_t* inData = nullptr;  // holds the frame; the edge map is written into plane 0
  int32_t inRowBytes = 0;     // signed: a bottom-up buffer has a negative row distance
  int32_t inColumnBytes = 0;

  Rect outRect;
  const uint8_t* outData = nullptr;  // holds the frame too; only read
  int32_t outRowBytes = 0;
  int32_t outColumnBytes = 0;
};

// The host's side as the analysis needs it. Every call comes on the host's
// thread, inside the start selector.
class AnalysisHost {
 public:
  virtual ~AnalysisHost() = default;
  // The host's abort test: true when the user asked to cancel.
  virtual bool TestAbort() = 0;
  // The host's progress procedure.
  virtual void ReportProgress(int32_t done, int32_t total) = 0;
  // The filter's result code; stages store -128 here on a cancel.
  virtual void SetResultCode(int16_t code) = 0;
  // Stores the result record (corners in document coordinates). May throw the
  // framework's host error; the analysis frees what it holds and lets it pass.
  virtual void WriteFringeRecord(const CornerQuad& corners, int16_t confidence) = 0;
  // Stores the whole-document failure record. May throw like WriteFringeRecord.
  virtual void WriteEmptyFringeRecord() = 0;
};

}  // namespace Project
