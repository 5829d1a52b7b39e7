// Parallel batches: worker processes, each with its own loaded module (the
// module keeps module-wide state, so workers cannot share one). A worker
// that dies, or overruns the page time limit and is killed, costs only the
// page it was on; a new one takes its place.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "options.h"
#include "page_job.h"
#include "page_result.h"

namespace Fringe {

class WorkerPool {
 public:
  // pageTimeout: seconds a worker may spend on one page (0: no limit).
  WorkerPool(int workers, std::string modulePath, const PageSettings& settings,
             int pageTimeout = 0);

  // Runs every task and calls done(index, result) as each one finishes, in
  // the order they finish. Failures of a worker become that page's error.
  void Run(const std::vector<PageTask>& tasks, const std::function<void(size_t, PageResult)>& done);

 private:
  int workers_;
  std::string setupLine_;
  int pageTimeout_;
};

}  // namespace Fringe
