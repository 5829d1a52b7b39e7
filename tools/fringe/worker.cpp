// The worker loop.
#include "worker.h"

#include <iostream>
#include <memory>
#include <string>

#include "exit_codes.h"
#include "page_job.h"
#include "photo_detector.h"
#include "worker_protocol.h"

namespace Fringe {

int RunWorker() {
  std::string line;
  if (!std::getline(std::cin, line)) return kExitInternal;
  std::string modulePath;
  PageSettings settings;
  std::unique_ptr<PhotoDetector> detector;
  std::unique_ptr<PageProcessor> processor;
  try {
    ParseSetupLine(line, modulePath, settings);
    detector = std::make_unique<PhotoDetector>(modulePath);
    processor = std::make_unique<PageProcessor>(*detector, settings);
  } catch (const std::exception& e) {
    std::cout << FatalLine(e.what()) << std::endl;
    return kExitInternal;
  }
  while (std::getline(std::cin, line)) {
    size_t id = 0;
    PageTask task;
    try {
      std::tie(id, task) = ParseJobLine(line);
    } catch (const std::exception& e) {
      std::cout << FatalLine(std::string("bad job line: ") + e.what()) << std::endl;
      return kExitInternal;
    }
    // endl flushes: the coordinator waits for each reply.
    std::cout << ReplyLine(id, processor->Process(task)) << std::endl;
  }
  return kExitOk;
}

}  // namespace Fringe
