// One page from file to result: decode, detect, then write what was asked.
// Detection and the outputs are separate steps so that a step refining the
// module's outline can later sit between them.
#pragma once

#include <memory>
#include <string>

#include "options.h"
#include "output_dir.h"
#include "page_result.h"
#include "photo_detector.h"

namespace Fringe {

struct PageTask {
  std::string path;     // where to open the file
  std::string display;  // how the user named it; the result's "file"
  std::string outStem;  // output name below the output folder, without extension
};

class PageProcessor {
 public:
  // Creates the output folder when outputs are requested; throws PageError.
  PageProcessor(PhotoDetector& detector, const PageSettings& settings);

  // Never throws: every failure becomes an error result naming the reason.
  PageResult Process(const PageTask& task);

 private:
  void WriteOutputs(const PageTask& task, const DecodedPage& page, const PhotoOutline& outline,
                    PageResult& result);

  PhotoDetector& detector_;
  PageSettings settings_;
  std::unique_ptr<OutputDir> out_;
};

}  // namespace Fringe
