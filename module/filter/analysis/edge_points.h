// Edge point search: scans the edge map inward from the four sides of the
// search rectangle and keeps the first edge pixel of every scanned line.
#pragma once

#include "filter/analysis/double_list.h"
#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"
#include "filter/analysis/types.h"

namespace Project {

// Clamps the rectangle to the frame less its outermost pixel ring and scans
// it: from the left (rows in order), from the right, from the top (columns
// in order), from the bottom. X gets the column and Y the row of each point,
// in that order. One abort test and one progress step per line. True when at
// least one point was found. On every false answer both lists are released.
bool FindEdgePoints(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                    DoubleList& ys, ProgressCounter& progress);

}  // namespace Project
