// fringe-accuracy: development entry (grows into the accuracy report).
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>

#include "accuracy/evaluation.h"
#include "accuracy/memory_detector.h"
#include "accuracy/page_io.h"
#include "refine/pipeline.h"
#include "refine/refine.h"
#include "refine/aligned_profile.h"
#include "refine/side_reading.h"
#include "synth/hard_pages.h"

int main(int argc, char** argv) {
  try {
    Accuracy::StartImageLibrary(argv[0]);
    const int count = argc > 1 ? std::stoi(argv[1]) : 15;
    const int only = argc > 2 ? std::stoi(argv[2]) : -1;
    Accuracy::MemoryDetector detector;
    std::vector<Accuracy::Score> raws, refs;
    int index = 0;
    for (const auto& spec : Synth::HardPageSet(count, 1)) {
      ++index;
      if (only >= 0 && index - 1 != only) continue;
      const auto hard = Synth::GenerateHardPage(spec);
      Accuracy::PageBuffer page{hard.page.width, hard.page.height, hard.page.channels, hard.page.pixels};
      if (spec.jpegQuality > 0) page = Accuracy::JpegRoundTrip(page, spec.jpegQuality);
      Accuracy::Truth truth;
      truth.photo = hard.hasPhoto;
      for (size_t k = 0; k < 4; ++k) truth.corners[k] = {hard.paper[k][0], hard.paper[k][1]};
      if (hard.hasPhoto) truth.angle = spec.angleDegrees;
      Refine::PipelineOptions popt;
      Refine::RefineOptions ropt;
      const int dumpSide = getenv("DUMP") ? atoi(getenv("DUMP")) : -1;
      ropt.inspect = [dumpSide](int side, const Refine::AlignedProfile& p, const Refine::SideReading& r) {
        if (side != dumpSide) return;
        std::printf("side %d slope %.5f noise %.2f lid %.1f/%.1f lines %d found %d offset %.2f pol %d band %d(%.1f) margin %d(%.1f) %s\n",
                    side, p.slope, p.noise, r.lid, r.expectedLid, p.lines, r.found, r.offset, r.polarity, r.band, r.bandWidth, r.margin, r.innerOffset, r.note.c_str());
        for (int k = 0; k < p.Size(); ++k) std::printf("  s %6.1f mean %7.2f rough %6.2f\n", p.OffsetOf(k), p.mean[k], p.roughness[k]);
      };
      popt.refinement = ropt;
      const auto result = Refine::DetectAndRefine(detector, page.View(), popt);
      const auto& answer = result.raw;
      const auto& refined = result.refined;
      Accuracy::Answer raw{answer.FoundPhoto(), answer.corners, answer.angle};
      Accuracy::Answer ref{refined.status != Refine::RefineStatus::kNoPhoto, refined.outline, refined.angle};
      for (auto& c : raw.corners) c = {c.x + 0.5, c.y + 0.5};
      for (auto& c : ref.corners) c = {c.x + 0.5, c.y + 0.5};
      const auto sr = Accuracy::ScoreAnswer(truth, raw);
      const auto sf = Accuracy::ScoreAnswer(truth, ref);
      raws.push_back(sr);
      refs.push_back(sf);
      std::printf("%3d %-13s raw %7.2f %s  ref %7.2f %s  %-8s |", index - 1, std::string(Synth::HardKindName(spec.kind)).c_str(),
                  sr.maxCornerError, sr.found ? "ok" : (sr.photoPage ? "--" : (sr.falseAlarm ? "FA" : "q ")),
                  sf.maxCornerError, sf.found ? "ok" : (sf.photoPage ? "--" : (sf.falseAlarm ? "FA" : "q ")),
                  std::string(Refine::StatusName(refined.status)).c_str());
      for (const auto& side : refined.sides)
        std::printf(" %s%s%s/%.1f/%.2f", std::string(Refine::StatusName(side.status)).substr(0, 3).c_str(),
                    side.band ? "+b" : "", side.margin ? "+m" : "", side.shift, side.rms);
      if (getenv("DETAIL")) {
        std::printf("\n   truth:");
        for (auto& c : truth.corners) std::printf(" (%.1f,%.1f)", c.x, c.y);
        std::printf("\n   raw:  ");
        for (auto& c : raw.corners) std::printf(" (%.1f,%.1f)", c.x, c.y);
        std::printf(" angle %.3f\n   ref:  ", answer.angle);
        for (auto& c : ref.corners) std::printf(" (%.1f,%.1f)", c.x, c.y);
        std::printf(" angle %.3f truth %.3f\n", refined.angle, spec.angleDegrees);
        for (const auto& side : refined.sides) std::printf("   %s\n", side.note.c_str());
      }
      for (const auto& p : result.preparations) std::printf(" [%s]", p.kind.c_str());
      std::printf("  det %.0fms prep %.1fms ref %.1fms\n", result.detectSeconds * 1e3, result.prepareSeconds * 1e3,
                  result.refineSeconds * 1e3);
      if (getenv("DETAIL")) for (const auto& p : result.preparations) std::printf("   %s\n", p.detail.c_str());
    }
    for (int pass = 0; pass < 2; ++pass) {
      const auto s = Accuracy::Summarise(pass == 0 ? raws : refs);
      std::printf("%s: found %d/%d blank quiet %d/%d  mean %.2f median %.2f p95 %.2f max %.1f  angle mean %.3f max %.3f\n",
                  pass == 0 ? "raw" : "refined", s.found, s.photoPages, s.blankQuiet, s.blankPages, s.meanError,
                  s.medianError, s.p95Error, s.maxError, s.meanAngleError, s.maxAngleError);
    }
  } catch (const std::exception& e) {
    std::fprintf(stderr, "fringe-accuracy: %s\n", e.what());
    return 1;
  }
  return 0;
}
