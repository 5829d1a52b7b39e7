// Turning the command line's files and folders into the list of pages:
// folders are searched recursively for image files, each folder at most once
// however symbolic links loop, and every page gets a unique output name.
#pragma once

#include <string>
#include <vector>

#include "page_job.h"

namespace Fringe {

struct InputEntry {
  PageTask task;
  std::string error;  // non-empty: this name cannot be processed, and why
};

// excludeDir (may be empty) is left out of the search, so that outputs
// written inside an input folder are not read back as pages.
std::vector<InputEntry> ExpandInputs(const std::vector<std::string>& args,
                                     const std::string& excludeDir);

// True when name ends in a suffix of a format that libvips loads.
bool HasImageSuffix(const std::string& name);

}  // namespace Fringe
