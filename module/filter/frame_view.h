// What the analysis may see of the host's filter record: the delivered frame,
// its layout, and the document it belongs to.
#pragma once

#include "filter/analysis/frame.h"
#include "host/filter_record.h"

namespace Project {

FrameView FrameViewFromRecord(const Vireo::FilterRecord& record);

}  // namespace Project
