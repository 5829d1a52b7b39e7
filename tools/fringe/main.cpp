// fringe: the command-line program.
#include <signal.h>

#include <cstdio>
#include <exception>

#include <vips/vips8>

#include "batch.h"
#include "cli.h"
#include "exit_codes.h"
#include "worker.h"

namespace {

void SetUpVips(const char* argv0, bool worker) {
  if (VIPS_INIT(argv0) != 0) {
    std::fprintf(stderr, "fringe: cannot start libvips\n");
    std::exit(Fringe::kExitInternal);
  }
  // Decoders report through libvips' error buffer, which fringe turns into
  // one error line per file; their warnings would only repeat it.
  g_log_set_handler(
      "VIPS", G_LOG_LEVEL_WARNING, [](const gchar*, GLogLevelFlags, const gchar*, gpointer) {},
      nullptr);
  // Loaders that libvips itself does not trust with hostile files stay off.
  vips_block_untrusted_set(TRUE);
  // Each page is decoded once and used at once: caching would only hold memory.
  vips_cache_set_max(0);
  vips_cache_set_max_mem(0);
  vips_cache_set_max_files(0);
  // Parallel batches already use every core through worker processes.
  if (worker) vips_concurrency_set(1);
}

}  // namespace

int main(int argc, char** argv) {
  // A worker that dies shows as the end of its pipe, not as a signal here.
  ::signal(SIGPIPE, SIG_IGN);
  const bool worker = argc == 2 && std::string(argv[1]) == Fringe::kWorkerCommand;
  int rc = Fringe::kExitInternal;
  try {
    if (worker) {
      SetUpVips(argv[0], true);
      rc = Fringe::RunWorker();
    } else {
      int parseExit = 0;
      const auto options = Fringe::ParseCommandLine(argc, argv, parseExit);
      if (!options) return parseExit;
      SetUpVips(argv[0], false);
      rc = Fringe::RunBatch(*options);
    }
  } catch (const std::exception& e) {
    std::fprintf(stderr, "fringe: internal error: %s\n", e.what());
    rc = Fringe::kExitInternal;
  }
  vips_shutdown();
  return rc;
}
