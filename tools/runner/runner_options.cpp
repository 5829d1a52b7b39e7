// Parsing the runner's command line.
#include "runner_options.h"

#include <cstdlib>
#include <sstream>
#include <vector>

#include "standin/error.h"

namespace Runner {

namespace {

[[noreturn]] void Refuse(const std::string& message) {
  throw Standin::Error(message);
}

std::vector<double> Numbers(const std::string& option, const std::string& text, size_t count,
                            char separator) {
  std::vector<double> numbers;
  std::stringstream stream(text);
  std::string part;
  while (std::getline(stream, part, separator)) {
    char* end = nullptr;
    double value = std::strtod(part.c_str(), &end);
    if (part.empty() || *end != '\0') Refuse(option + ": '" + part + "' is not a number");
    numbers.push_back(value);
  }
  if (numbers.size() != count) {
    Refuse(option + " takes " + std::to_string(count) + " numbers, got '" + text + "'");
  }
  return numbers;
}

int64_t Integer(const std::string& option, const std::string& text, int64_t low, int64_t high) {
  char* end = nullptr;
  long long value = std::strtoll(text.c_str(), &end, 10);
  if (text.empty() || *end != '\0' || value < low || value > high) {
    Refuse(option + ": '" + text + "' is not a whole number from " + std::to_string(low) + " to " +
           std::to_string(high));
  }
  return value;
}

}  // namespace

const char* UsageText() {
  return R"(fringe-runner: one complete filter run of a module file through the stand-in host

usage: fringe-runner [options]
       fringe-runner --golden FILE | --sweep COUNT SEED FILE | --compare FILE

module
  --module PATH          module file (default: Fringe.9zf beside this program)
  --private              load a private copy of the module file
document (default: a 2000 x 1500 RGB scan with a photo turned 7 degrees)
  --size WxH             document size in pixels
  --mode gray|rgb|N      image mode (N: any 16-bit value, to play a broken host)
  --alpha                a transparency plane after the colours (filter case 4)
  --planes N             planes announced (default: from the mode and --alpha)
  --rect T,L,B,R         filter rectangle (default: the whole document)
  --case N               filter case (default 1, 2 with --rect, 4 or 5 with --alpha)
  --budget BYTES         largest memory budget announced at prepare
  --raw FILE             pixels from FILE (planes of a pixel together, rows tight)
  --photo CX,CY,W,H,DEG  the synthetic photo's centre, size and angle
  --blank                a page without a photo
  --seed N --noise SIGMA --lid-shadow    synthetic page texture
host behaviour
  --cancel-at N          the abort test answers cancel from its N-th call on
  --continues N          continue selectors to send (default 1)
  --row-padding N        bytes after each row of the input buffer
  --bottom-up            input rows last to first (negative row distance)
page sets (for comparing two builds of the module)
  --golden FILE          run the golden pages, write their results to FILE
  --sweep COUNT SEED FILE   run COUNT pages drawn from SEED, write results to FILE
  --compare FILE         run the pages FILE names and compare with its results
)";
}

Options ParseOptions(int argc, char** argv) {
  Options options;
  options.page.photo = Synth::PhotoRecipe{1000, 760, 1200, 820, 7.0};
  bool blank = false;
  std::optional<Synth::PhotoRecipe> photo;
  for (int i = 1; i < argc; ++i) {
    std::string option = argv[i];
    auto value = [&]() -> std::string {
      if (i + 1 >= argc) Refuse(option + " needs a value");
      return argv[++i];
    };
    if (option == "--help" || option == "-h") {
      options.mode = Mode::Help;
    } else if (option == "--module") {
      options.module = value();
    } else if (option == "--private") {
      options.privateCopy = true;
    } else if (option == "--size") {
      std::string size = value();
      size_t x = size.find('x');
      if (x == std::string::npos) Refuse(option + " takes WIDTHxHEIGHT, got '" + size + "'");
      options.width = static_cast<int32_t>(Integer(option, size.substr(0, x), 1, 65535));
      options.height = static_cast<int32_t>(Integer(option, size.substr(x + 1), 1, 65535));
    } else if (option == "--mode") {
      std::string mode = value();
      options.imageMode = mode == "gray" ? int16_t{1}
                          : mode == "rgb"
                              ? int16_t{3}
                              : static_cast<int16_t>(Integer(option, mode, -32768, 65535));
    } else if (option == "--alpha") {
      options.alpha = true;
    } else if (option == "--planes") {
      options.planes = static_cast<int16_t>(Integer(option, value(), -32768, 32767));
    } else if (option == "--rect") {
      std::vector<double> r = Numbers(option, value(), 4, ',');
      options.rect = std::array<int32_t, 4>{static_cast<int32_t>(r[0]), static_cast<int32_t>(r[1]),
                                            static_cast<int32_t>(r[2]), static_cast<int32_t>(r[3])};
    } else if (option == "--case") {
      options.filterCase = static_cast<int16_t>(Integer(option, value(), -32768, 32767));
    } else if (option == "--budget") {
      options.budget = static_cast<int32_t>(Integer(option, value(), -2147483648LL, 2147483647LL));
    } else if (option == "--raw") {
      options.rawFile = value();
    } else if (option == "--photo") {
      std::vector<double> p = Numbers(option, value(), 5, ',');
      photo = Synth::PhotoRecipe{p[0], p[1], p[2], p[3], p[4]};
    } else if (option == "--blank") {
      blank = true;
    } else if (option == "--seed") {
      options.page.seed = static_cast<uint32_t>(Integer(option, value(), 0, 4294967295LL));
    } else if (option == "--noise") {
      options.page.noise = Numbers(option, value(), 1, ',')[0];
    } else if (option == "--lid-shadow") {
      options.page.lidShadow = true;
    } else if (option == "--cancel-at") {
      options.cancelAt = static_cast<int32_t>(Integer(option, value(), 1, 2147483647LL));
    } else if (option == "--continues") {
      options.continues = static_cast<int>(Integer(option, value(), 0, 1000));
    } else if (option == "--row-padding") {
      options.rowPadding = static_cast<int32_t>(Integer(option, value(), 0, 1 << 20));
    } else if (option == "--bottom-up") {
      options.bottomUp = true;
    } else if (option == "--golden") {
      options.mode = Mode::Golden;
      options.resultsFile = value();
    } else if (option == "--sweep") {
      options.mode = Mode::Sweep;
      options.sweepCount = static_cast<int>(Integer(option, value(), 1, 1000000));
      options.sweepSeed = static_cast<uint64_t>(Integer(option, value(), 0, INT64_MAX));
      options.resultsFile = value();
    } else if (option == "--compare") {
      options.mode = Mode::Compare;
      options.resultsFile = value();
    } else {
      Refuse("unknown option '" + option + "' (see --help)");
    }
  }
  if (blank) {
    options.page.photo.reset();
  } else if (photo) {
    options.page.photo = photo;
  } else if (options.width != 2000 || options.height != 1500) {
    // The default photo scaled to the chosen size.
    options.page.photo = Synth::PhotoRecipe{options.width * 0.5, options.height * 0.5067,
                                            options.width * 0.6, options.height * 0.5467, 7.0};
  }
  options.page.width = options.width;
  options.page.height = options.height;
  options.page.color = options.imageMode != 1;
  options.page.alpha = options.alpha;
  return options;
}

}  // namespace Runner
