// Darkness profiles: how dark each row and each column of the frame is in
// total, and the darkness-weighted centre of a profile.
#pragma once

#include "filter/analysis/double_list.h"
#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"

namespace Project {

// Fills the column profile (W entries) and the row profile (H entries) from
// the input buffer; both lists must already hold that many entries. One
// progress step per row of the row pass. On a cancel it stops at once and
// leaves the lists as they stand, neither cleared nor normalised.
void ComputeProfiles(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                     DoubleList& rows, ProgressCounter& progress);

// The centroid position in entry units; the middle when the moment is 0.
double ProfileCentroid(const DoubleList& profile);

}  // namespace Project
