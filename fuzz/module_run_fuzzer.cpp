// Fuzz target: the built module file driven through the stand-in host with a
// fuzzed document (size, mode, planes, filter case and rectangle, budget,
// buffer layouts), fuzzed faults in the host's procedures and tables, fuzzed
// lies at buffer delivery that the module can see through, and either whole
// runs in host order or arbitrary selector sequences. One module is loaded
// for the whole session, as a host keeps it loaded.
//
// Checked on every input: the host saw nothing amiss (no handle disposed
// twice or foreign, no output written, no exception escaping, result word
// always written, no leak after a run in host order), at most one 'fRNG'
// record (unless the host's own get or delete kept an old one), and every
// result 0, 1 or a code the host itself produced.
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <set>
#include <string>

#include "fuzz_bytes.h"
#include "fuzz_check.h"
#include "standin/host.h"
#include "synth/page_generator.h"

namespace {

constexpr uint32_t kRecordType = 0x66524E47;  // 'fRNG'
constexpr const char* kModuleVariable = "FRINGE_MODULE";

Standin::Module& LoadedModule() {
  static std::unique_ptr<Standin::Module> module = [] {
    const char* path = std::getenv(kModuleVariable);
    return Standin::Module::Load(path != nullptr && *path != '\0' ? path : FRINGE_MODULE_PATH,
                                 true);
  }();
  return *module;
}

int32_t Side(FuzzInput::Bytes& in) {
  // The sizes where the analysis changes its mind, then anything up to a few hundred.
  static constexpr int32_t kEdges[] = {0, 1, 2, 26, 27, 28, 64};
  return in.Bool() ? in.Pick(kEdges) : in.Range(0, 320);
}

Standin::Document MakeDocument(FuzzInput::Bytes& in) {
  const int32_t width = Side(in), height = Side(in);
  const int channels = in.Bool() ? 3 : 1;
  const bool alpha = in.Bool();
  const uint8_t content = in.Byte() % 4;
  Standin::Document doc(width, height, channels, alpha);
  const int planes = channels + (alpha ? 1 : 0);
  if (content == 1 && width >= 27 && height >= 27) {
    // A real photo on a page, so that inputs reach deep into the analysis.
    Synth::PageRecipe recipe;
    recipe.width = width;
    recipe.height = height;
    recipe.color = channels == 3;
    recipe.alpha = alpha;
    recipe.seed = in.U16();
    recipe.photo =
        Synth::PhotoRecipe{width * (0.3 + in.Byte() / 640.0), height * (0.3 + in.Byte() / 640.0),
                           width * (0.2 + in.Byte() / 512.0), height * (0.2 + in.Byte() / 512.0),
                           in.Range(-450, 450) / 10.0};
    Synth::Page page = Synth::GeneratePage(recipe);
    doc.SetPixels(std::move(page.pixels), static_cast<std::ptrdiff_t>(width) * planes);
  } else if (content == 2 && width > 0 && height > 0) {
    // Noise from a seed: cheap, and every sample differs.
    std::vector<uint8_t> pixels(static_cast<size_t>(width) * height * planes);
    uint32_t state = in.U32() | 1u;
    for (uint8_t& p : pixels) {
      state ^= state << 13;
      state ^= state >> 17;
      state ^= state << 5;
      p = static_cast<uint8_t>(state);
    }
    doc.SetPixels(std::move(pixels), static_cast<std::ptrdiff_t>(width) * planes);
  } else {
    doc.SetFill(in.Byte());
  }

  // Values no real document has, as a careless or hostile host writes them.
  if (in.Byte() < 40) doc.imageMode = in.Pick<int16_t>({0, 1, 2, 3, 4, 7, 8, 9, -1, 32767});
  if (in.Byte() < 40) doc.planes = static_cast<int16_t>(in.Range(-2, 6));
  if (in.Byte() < 40) doc.filterCase = static_cast<int16_t>(in.Range(-1, 9));
  if (in.Byte() < 60) {
    for (int32_t& side : doc.filterRect) {
      side = in.Bool() ? in.Range(-40, 360) : static_cast<int32_t>(in.I16());
    }
  }
  if (in.Byte() < 60) doc.maxSpace = in.Bool() ? in.Range(0, 1 << 20) : in.I32();
  return doc;
}

void ShapeHost(FuzzInput::Bytes& in, Standin::Host& host, Fuzz::RunFaults& faults) {
  auto layout = [&in](Standin::BufferLayout& l) {
    if (in.Byte() < 200) return;
    l.rowPadding = in.Range(0, 9);
    l.columnPadding = in.Range(0, 2);
    l.bottomUp = in.Bool();
  };
  layout(host.inputLayout);
  layout(host.outputLayout);
  if (in.Byte() < 30) host.deliveryLimit = in.Range(0, 1 << 18);
  if (in.Byte() < 30) host.suiteBufferSpace = static_cast<uint32_t>(in.Range(0, 1 << 20));
  if (in.Byte() < 30) host.CancelAt(in.Range(1, 200), in.Bool());

  const int faultCount = in.Byte() % 4;
  for (int i = 0; i < faultCount; ++i) {
    const auto proc = static_cast<Standin::Proc>(in.Range(0, Standin::kProcCount - 1));
    switch (in.Byte() % 4) {
      case 0:
        host.Faults().Remove(proc);
        faults.Removed(proc);
        break;
      case 1:
      case 2: {
        const int32_t error = in.Bool() ? -108 : in.Pick<int32_t>({-1, -50, -109, -128, -9999, 5});
        host.Faults().FailAt(proc, in.Range(1, 40), in.Bool() ? -1 : in.Range(1, 3), error);
        faults.Failing(proc, error);
        break;
      }
      default:
        host.Faults().RaiseAt(proc, in.Range(1, 40));
        faults.Failing(proc, 0);
        break;
    }
  }
  if (in.Byte() < 25) {
    const auto table = static_cast<Standin::Table>(in.Range(0, Standin::kTableCount - 1));
    Standin::TableShape shape;
    shape.absent = in.Bool();
    if (!shape.absent) shape.count = static_cast<int16_t>(in.Range(-1, 12));
    host.Faults().SetTable(table, shape);
    faults.Shaped(table);
  }

  // Lies at buffer delivery that a careful module can see through: no
  // buffer after success, a refusal, rows shorter than a row of pixels, an
  // empty or reversed input rectangle.
  if (in.Byte() < 50) {
    const int32_t at = in.Range(1, 6);
    const uint8_t lie = in.Byte() % 5;
    const int16_t code = in.Pick<int16_t>({-108, -50, -1, -128});
    const int16_t shrink = static_cast<int16_t>(in.Range(1, 4));
    if (lie == 1) faults.Produces(code);
    auto count = std::make_shared<int32_t>(0);
    host.deliveryHook = [=](Standin::Delivery& d, Standin::ByteBlock& record) {
      if (++*count != at) return;
      switch (lie) {
        case 0:
          (shrink % 2 == 0 ? d.inData : d.outData) = nullptr;
          break;
        case 1:
          d.result = code;
          break;
        case 2:
          if (d.inRowBytes > shrink) d.inRowBytes -= shrink;
          if (d.inRowBytes < -shrink) d.inRowBytes += shrink;
          break;
        case 3:
          record.Put<int16_t>(Standin::Abi::Filter::kInRect + 4,
                              record.Get<int16_t>(Standin::Abi::Filter::kInRect));
          break;
        default:
          record.Put<int16_t>(Standin::Abi::Filter::kInRect + 6,
                              static_cast<int16_t>(
                                  record.Get<int16_t>(Standin::Abi::Filter::kInRect + 2) - shrink));
          break;
      }
    };
  }
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  // Alerts would otherwise go to standard error on every failing input.
  setenv("FRINGE_ALERT_LOG", "/dev/null", 1);
  LoadedModule();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  FuzzInput::Bytes in(data, size);
  Fuzz::RunFaults faults;
  Standin::Host host(LoadedModule(), MakeDocument(in));
  ShapeHost(in, host, faults);

  const int runs = 1 + in.Byte() % 2;
  for (int run = 0; run < runs; ++run) {
    std::string what = "run " + std::to_string(run);
    if (in.Byte() < 200) {
      // A host's own order, stopping at a failure (or, now and then, not).
      Standin::RunPlan plan;
      plan.parameters = in.Byte() < 230;
      plan.continues = in.Range(0, 3);
      plan.stopOnFailure = in.Byte() < 230;
      const Standin::RunReport report = host.Run(plan);
      for (size_t s = 0; s < report.results.size(); ++s) {
        if (report.called[s])
          faults.CheckResult(report.results[s], what + " selector " + std::to_string(s));
      }
      faults.CheckProblems(host.Problems(), plan.stopOnFailure, what);
    } else {
      // Any order at all, unknown selectors included.
      host.BeginRun();
      const int calls = in.Range(0, 8);
      for (int i = 0; i < calls; ++i) {
        const int16_t selector = static_cast<int16_t>(in.Range(-1, 7));
        faults.CheckResult(host.Call(selector), what + " selector " + std::to_string(selector));
      }
      // A host always ends with finish: the stand-in's tables last only as
      // long as this host, so nothing of this run may outlive it.
      faults.CheckResult(host.Call(Standin::kFinish), what + " closing finish");
      faults.CheckProblems(host.Problems(), false, what);
    }
    host.Problems().Clear();
    Fuzz::Check(host.Records(kRecordType).size() <= 1 || faults.HostKeepsRecords(),
                "more than one 'fRNG' record after " + what);
  }
  // A run that stopped at a failing continue leaves its object alive for the
  // next run; this host's next run is its last, a lone finish that ends the
  // object before the host goes, so that every input starts from a module
  // with no run in progress.
  host.BeginRun();
  faults.CheckResult(host.Call(Standin::kFinish), "the last finish");
  faults.CheckProblems(host.Problems(), false, "the last finish");
  Fuzz::Check(host.Records(kRecordType).size() <= 1 || faults.HostKeepsRecords(),
              "more than one 'fRNG' record at the end");
  return 0;
}
