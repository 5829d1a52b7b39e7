// Everything a fringe run is asked to do, as parsed from the command line.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace Fringe {

// What is written for each page besides the result itself.
struct OutputRequest {
  bool outline = false;  // the page with the detected outline drawn on it
  bool photo = false;    // the photo cut out and straightened
};

// Settings that a worker needs to process one page exactly as the
// coordinator would; they travel to worker processes as JSON.
struct PageSettings {
  OutputRequest outputs;
  std::string outputDir;              // required when any output is requested
  std::string outlineFormat = "jpg";  // jpg or png
  std::string photoFormat;            // empty: the input's own format where it can be written
  int quality = 92;                   // JPEG and WebP quality of written files
  int margin = 0;                     // pixels added around the photo on every side of the crop
  int32_t maxSide = 0;  // 0: refuse pages above the module's limit; else detect on a copy this size
  uint64_t maxPixels = 250000000;  // refuse files whose header promises more pixels
  bool refine = true;              // prepare the page and refine the module's answer
  bool pictureEdge = false;        // draw and crop the picture inside a white margin, not the paper
};

struct Options {
  std::string command;  // detect, draw, crop or all
  std::vector<std::string> inputs;
  PageSettings page;
  std::string modulePath;  // empty: next to the program
  int jobs = 0;            // 0: one per processor
  bool json = false;
  std::string resultsFile;
  bool quiet = false;
  int pageTimeout = 120;  // seconds a worker may spend on one page; 0: no limit
};

}  // namespace Fringe
