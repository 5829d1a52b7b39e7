// Box fit: turns the edge points upright, fits an upright box to them, pulls
// it in and turns its corners back.
#pragma once

#include <cstdint>

#include "filter/analysis/double_list.h"
#include "filter/analysis/records.h"

namespace Project {

inline constexpr double kRadiansPerDegree = 0.017453293;

// Turns (x, y) about the centre by theta radians:
// x' = (dx cos + cx) + dy sin, y' = (dy cos + cy) - dx sin.
void RotatePoint(PointD& point, double theta, const PointD& centre);

// Turns every point by -angle degrees about the centre, in place.
void StraightenPoints(DoubleList& xs, DoubleList& ys, double angleDegrees, const PointD& centre);

// In place, entries half ... len - tail - 1 become the sum of the w entries
// around them (half = w / 2 before, tail = w - half - 1 after), taken from the
// array as it was; the entries at either end keep their values. A window of 0
// clears the array. scratch holds length entries for the old values.
void WindowSum(double* values, double* scratch, int32_t length, int32_t window);

// The occupancy edges of one axis: origin + the first and origin + the last
// cell whose smoothed occupancy lies within 1.0 of half the largest; cell 0
// when there is no first, the last cell when there is no last or it is 0.
void OccupancyEdges(const double* occupancy, int32_t cells, double origin, double& nearEdge,
                    double& farEdge);

// Writes the box corners and answers true; false for no points, an empty cell
// range or a working array that cannot be had.
bool FitBox(const DoubleList& xs, const DoubleList& ys, BoxCorners& corners,
            const AnalysisParams& params);

// Moves every corner by b along the top side and by a along the right side;
// negative margins move inward. Leaves a degenerate box alone.
void GrowQuad(BoxCorners& corners, double a, double b);

}  // namespace Project
