// The worker side of parallel batches: a process of its own with its own
// loaded module, taking pages from standard input and answering on standard
// output until its input ends.
#pragma once

namespace Fringe {

// The hidden subcommand that starts a worker.
inline constexpr const char* kWorkerCommand = "__worker";

int RunWorker();

}  // namespace Fringe
