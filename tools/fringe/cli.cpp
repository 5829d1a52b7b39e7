// Command-line parsing with CLI11.
#include "cli.h"

#include <CLI/CLI.hpp>

#include "exit_codes.h"
#include "image_saver.h"
#include "page_loader.h"

#ifndef FRINGE_VERSION
#define FRINGE_VERSION "0"
#endif

namespace Fringe {

namespace {

constexpr const char* kDescription =
    "fringe finds the photograph on flatbed scans: its four corners, the angle it is turned\n"
    "by and a confidence, with the Fringe module run exactly as the host runs it. It can\n"
    "also draw the outline on the page and cut the photo out straightened.";

constexpr const char* kFooter = R"(Coordinates:
  Corners are (x, y) pixel positions in the file's stored pixels (x the column, y the row,
  counted from the top-left pixel; an EXIF orientation is not applied), clockwise from the
  photo's top-left corner. The angle is in degrees as the module publishes it: positive when
  the photo is turned counter-clockwise on the page.

Inputs:
  Files of any format libvips reads (PNG, JPEG, TIFF, WebP, ...), 8- or 16-bit, gray, RGB,
  palette or CMYK, with or without alpha. Folders are searched recursively for image files
  (hidden names skipped, each folder once however links loop). Gray pages run as grayscale
  documents, everything else as RGB; alpha becomes the document's transparency.

Refinement:
  After the module has answered, fringe finds every side of the photo again in the page:
  edge positions along each side, a straight line fitted to each, corners where the lines
  meet. It puts the edge on the paper rather than on the lid's shadow, finds a white paper
  margin and the picture inside it, and where the page made the module fail (a dark strip of
  the scanner bed along an edge, heavy noise, a dark or uneven lid) runs the module again on
  a prepared page. Drawing and cropping follow the refined outline; --raw gives the module's
  answer everywhere. Refined corners are where the paper's edges meet, with pixel centres at
  whole numbers (an edge between two pixels lies at .5).

Output:
  One line per page on standard output, in the order the pages were named; --json gives
  JSON Lines: {"file", "status": "found"|"not_found"|"error", "width", "height",
  "mode": "gray"|"rgb", "alpha", "format", "confidence", "angle", "corners": [[x,y] x4],
  "refined", "outline", "photo", "times_ms": {"decode","detect","write","prepare","refine"},
  "error", "error_kind"}. "confidence", "angle" and "corners" are the module's answer exactly
  as it published it; the angle reads back to the exact double, and is 0 when no photo was
  found. "refined" holds {"status": "refined"|"partial"|"kept"|"no-photo", "reason", "found",
  "corners": [[x,y] x4], "angle", "sides": [{"side", "status", "rms", "support", "contrast",
  "band", "margin", "note"} x4], "margin", "picture", "preparations": [{"kind", "detail"}],
  "prepared": {"confidence", "angle", "corners", "filter_rect"}}; "status" (found or not)
  follows the refined answer unless --raw is given. Written files are <name>.outline.<ext> and <name>.photo.<ext> below --output,
  mirroring the input folders. Errors go to standard error, naming the file.

Exit codes:
  0   every page had a photo
  1   some page had no photo
  2   some input could not be read, decoded, or was refused (too large, not an image)
  64  wrong command line
  70  internal failure: the module could not be loaded or run, a worker process died or a
      page overran --page-timeout
  73  an output file could not be written
  A batch exits with the most serious of its pages' codes.

Examples:
  fringe detect scan.jpg
  fringe all scan.jpg -o out
  fringe crop --json -j 4 --results done.jsonl scans/ -o photos)";

void AddCommon(CLI::App* sub, Options& o) {
  sub->add_option("inputs", o.inputs, "Image files or folders")->required()->type_name("FILE|DIR");
  sub->add_flag("--json", o.json, "Print one JSON object per page (JSON Lines)");
  sub->add_option("-j,--jobs", o.jobs, "Pages processed in parallel (default: one per core)")
      ->check(CLI::Range(1, 1024))
      ->type_name("N");
  sub->add_option("--results", o.resultsFile,
                  "Append each page's JSON result to FILE; pages already in it are skipped, "
                  "so an interrupted batch resumes where it stopped")
      ->type_name("FILE");
  sub->add_flag("-q,--quiet", o.quiet, "No progress or summary on standard error");
  sub->add_option("--page-timeout", o.pageTimeout,
                  "Seconds a page may take; a page still running then is stopped and reported "
                  "as failed (0: no limit)")
      ->capture_default_str()
      ->check(CLI::Range(0, 86400))
      ->type_name("SECONDS");
  sub->add_option("--module", o.modulePath, "The module file (default: Fringe.9zf next to fringe)")
      ->type_name("FILE");
  sub->add_option("--max-side", o.page.maxSide,
                  "Detect on a copy no larger than N pixels a side; corners are scaled back. "
                  "Needed for pages above 32767 pixels a side")
      ->check(CLI::Range(27, kModuleMaxSide))
      ->type_name("N");
  sub->add_flag_callback(
      "--raw", [&o] { o.page.refine = false; },
      "Report, draw and crop the module's answer as it stands: no page preparation, no "
      "refinement");
  sub->add_option("--max-pixels", o.page.maxPixels,
                  "Refuse files whose header promises more pixels than this")
      ->capture_default_str()
      ->check(CLI::Range(uint64_t{1}, uint64_t{1} << 40))
      ->type_name("N");
}

void AddWriting(CLI::App* sub, Options& o, bool outline, bool photo) {
  sub->add_option("-o,--output", o.page.outputDir, "Folder for the written files")
      ->required()
      ->type_name("DIR");
  if (outline) {
    sub->add_option("--outline-format", o.page.outlineFormat, "jpg or png")
        ->capture_default_str()
        ->check(CLI::IsMember({"jpg", "png"}));
  }
  if (photo) {
    sub->add_option("--format", o.page.photoFormat,
                    "Photo file format: png, jpg, tif or webp (default: the input's own, "
                    "PNG where it cannot be written)")
        ->check(CLI::IsMember({"png", "jpg", "tif", "webp"}));
    sub->add_option("--margin", o.page.margin, "Pixels kept around the photo on every side")
        ->capture_default_str()
        ->check(CLI::Range(0, 10000));
  }
  sub->add_option_function<std::string>(
         "--edge", [&o](const std::string& edge) { o.page.pictureEdge = edge == "inner"; },
         "For prints with a white margin: outer (the paper's edge, default) or inner (the "
         "picture inside the margin)")
      ->check(CLI::IsMember({"outer", "inner"}))
      ->type_name("outer|inner");
  sub->add_option("--quality", o.page.quality, "JPEG and WebP quality")
      ->capture_default_str()
      ->check(CLI::Range(1, 100));
}

}  // namespace

std::optional<Options> ParseCommandLine(int argc, char** argv, int& exitCode) {
  Options o;
  CLI::App app(kDescription, "fringe");
  app.set_version_flag("--version", std::string("fringe ") + FRINGE_VERSION);
  app.require_subcommand(1);

  CLI::App* detect =
      app.add_subcommand("detect", "Print each page's corners, angle and confidence");
  CLI::App* draw = app.add_subcommand("draw", "Also write each page with the outline drawn on it");
  CLI::App* crop = app.add_subcommand("crop", "Also write each photo cut out and straightened");
  CLI::App* all = app.add_subcommand("all", "Write both the outline picture and the photo");
  for (CLI::App* sub : {detect, draw, crop, all}) AddCommon(sub, o);
  AddWriting(draw, o, true, false);
  AddWriting(crop, o, false, true);
  AddWriting(all, o, true, true);
  // Set last so that the subcommands' help stays short.
  app.footer(kFooter);

  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& e) {
    const int rc = app.exit(e);
    exitCode = rc == 0 ? kExitOk : kExitUsage;
    return std::nullopt;
  }
  for (CLI::App* sub : app.get_subcommands()) o.command = sub->get_name();
  o.page.outputs.outline = o.command == "draw" || o.command == "all";
  o.page.outputs.photo = o.command == "crop" || o.command == "all";
  return o;
}

}  // namespace Fringe
