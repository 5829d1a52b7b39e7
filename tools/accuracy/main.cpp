// fringe-accuracy: development entry (grows into the accuracy report).
#include <cstdio>
#include <exception>
#include <string>

#include "accuracy/page_io.h"
#include "synth/hard_pages.h"

int main(int argc, char** argv) {
  try {
    Accuracy::StartImageLibrary(argv[0]);
    const int count = argc > 1 ? std::stoi(argv[1]) : 15;
    const std::string dir = argc > 2 ? argv[2] : "/tmp/hard";
    for (const auto& spec : Synth::HardPageSet(count, 1)) {
      const auto hard = Synth::GenerateHardPage(spec);
      Accuracy::PageBuffer page{hard.page.width, hard.page.height, hard.page.channels, hard.page.pixels};
      const std::string name = dir + "/" + std::string(Synth::HardKindName(spec.kind)) + "-" +
                               std::to_string(spec.seed) + ".png";
      Accuracy::SavePage(page, name);
      std::printf("%s\n", name.c_str());
    }
  } catch (const std::exception& e) {
    std::fprintf(stderr, "fringe-accuracy: %s\n", e.what());
    return 1;
  }
  return 0;
}
