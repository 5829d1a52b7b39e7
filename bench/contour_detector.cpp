// DetectByContour over OpenCV.
#include "contour_detector.h"

#include <opencv2/imgproc.hpp>
#include <vector>

namespace Bench {

ContourBox DetectByContour(const uint8_t* pixels, int width, int height, int channels,
                           int rowBytes) {
  const cv::Mat frame(height, width, channels == 3 ? CV_8UC3 : CV_8UC1,
                      const_cast<uint8_t*>(pixels), static_cast<size_t>(rowBytes));
  cv::Mat gray;
  if (channels == 3) {
    cv::cvtColor(frame, gray, cv::COLOR_RGB2GRAY);
  } else {
    gray = frame;
  }
  cv::Mat mask;
  // The photo is darker than the paper.
  cv::threshold(gray, mask, 0, 255, cv::THRESH_BINARY_INV | cv::THRESH_OTSU);
  std::vector<std::vector<cv::Point>> contours;
  cv::findContours(mask, contours, cv::RETR_EXTERNAL, cv::CHAIN_APPROX_SIMPLE);
  ContourBox box;
  double largest = 0.0;
  const std::vector<cv::Point>* best = nullptr;
  for (const auto& contour : contours) {
    const double area = cv::contourArea(contour);
    if (area > largest) {
      largest = area;
      best = &contour;
    }
  }
  if (best == nullptr) return box;
  const cv::RotatedRect rect = cv::minAreaRect(*best);
  cv::Point2f corners[4];
  rect.points(corners);
  for (int k = 0; k < 4; ++k) {
    box.corners[2 * k] = corners[k].x;
    box.corners[2 * k + 1] = corners[k].y;
  }
  box.angle = rect.angle;
  box.found = true;
  return box;
}

}  // namespace Bench
