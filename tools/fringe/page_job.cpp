// Processing one page, with each stage timed.
#include "page_job.h"

#include <chrono>
#include <new>

#include "image_saver.h"
#include "outline_picture.h"
#include "photo_geometry.h"
#include "refine_step.h"
#include "straightened_photo.h"
#include "vips_text.h"

namespace Fringe {

namespace {

using Clock = std::chrono::steady_clock;

double MsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

}  // namespace

PageProcessor::PageProcessor(PhotoDetector& detector, const PageSettings& settings)
    : detector_(detector), settings_(settings) {
  if (settings_.outputs.outline || settings_.outputs.photo) {
    out_ = std::make_unique<OutputDir>(settings_.outputDir);
  }
}

void PageProcessor::WriteOutputs(const PageTask& task, const DecodedPage& page,
                                 const PhotoOutline& outline, PageResult& result) {
  if (!out_ || result.status != PageStatus::Found) return;
  if (settings_.outputs.outline) {
    result.outlinePath =
        SaveImage(*out_, task.outStem + ".outline." + settings_.outlineFormat,
                  OutlinePicture(page, outline), settings_.outlineFormat, settings_.quality);
  }
  if (settings_.outputs.photo) {
    const std::string ext =
        settings_.photoFormat.empty() ? PhotoExtensionFor(page.format) : settings_.photoFormat;
    const PhotoFrame frame = FrameOfPhoto(outline.corners, outline.angle, settings_.margin);
    result.photoPath = SaveImage(*out_, task.outStem + ".photo." + ext,
                                 StraightenedPhoto(page, frame), ext, settings_.quality);
  }
}

PageResult PageProcessor::Process(const PageTask& task) {
  PageResult result;
  result.file = task.display;
  try {
    auto start = Clock::now();
    const DecodedPage page =
        LoadPage(task.path, LoadLimits{settings_.maxPixels, settings_.maxSide});
    result.times.decodeMs = MsSince(start);
    result.width = page.width;
    result.height = page.height;
    result.gray = page.channels == 1;
    result.alpha = page.alpha;
    result.format = page.format;

    start = Clock::now();
    result.answer = detector_.Detect(page, settings_.maxSide);
    result.times.detectMs = MsSince(start);
    result.status = result.answer.found ? PageStatus::Found : PageStatus::NotFound;

    // The outputs follow the refined outline unless the module's own is asked for.
    PhotoOutline outline = OutlineOf(result.answer);
    if (settings_.refine) {
      result.refined = RefineOnPage(detector_, page, result.answer);
      result.status = result.refined.found ? PageStatus::Found : PageStatus::NotFound;
      if (result.refined.found) outline = OutlineFromRefined(result.refined, settings_.pictureEdge);
    }

    start = Clock::now();
    WriteOutputs(task, page, outline, result);
    result.times.writeMs = MsSince(start);
    return result;
  } catch (const PageError& e) {
    result.errorKind = e.Kind();
    result.error = e.what();
  } catch (const vips::VError& e) {
    result.errorKind = ErrorKind::Internal;
    result.error = "image processing failed: " + VipsReason(e);
  } catch (const std::bad_alloc&) {
    result.errorKind = ErrorKind::Internal;
    result.error = "out of memory";
  } catch (const std::exception& e) {
    result.errorKind = ErrorKind::Internal;
    result.error = e.what();
  }
  result.status = PageStatus::Error;
  return result;
}

}  // namespace Fringe
