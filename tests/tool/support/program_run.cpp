// Spawning fringe with its output captured in files.
#include "program_run.h"

#include <errno.h>
#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <sstream>
#include <stdexcept>

#include "temp_folder.h"

extern char** environ;

namespace FringeTest {

namespace {

std::string ReadAllOf(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::stringstream s;
  s << in.rdbuf();
  return s.str();
}

}  // namespace

std::string ReadFile(const std::string& path) {
  return ReadAllOf(path);
}

std::string FringeProgram() {
  return FRINGE_TEST_PROGRAM;
}
std::string FringeModule() {
  return FRINGE_TEST_MODULE;
}
std::string CrashingModule() {
  return FRINGE_TEST_CRASHING_MODULE;
}
std::string BrokenModule() {
  return FRINGE_TEST_BROKEN_MODULE;
}

std::vector<nlohmann::json> RunOutcome::JsonLines() const {
  std::vector<nlohmann::json> lines;
  std::istringstream in(out);
  std::string line;
  while (std::getline(in, line)) {
    if (!line.empty()) lines.push_back(nlohmann::json::parse(line));
  }
  return lines;
}

namespace {

pid_t Spawn(const std::vector<std::string>& args, const std::string& outPath,
            const std::string& errPath, const std::string& cwd) {
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, outPath.c_str(),
                                   O_WRONLY | O_CREAT | O_TRUNC, 0644);
  posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, errPath.c_str(),
                                   O_WRONLY | O_CREAT | O_TRUNC, 0644);
  if (!cwd.empty()) posix_spawn_file_actions_addchdir_np(&actions, cwd.c_str());
  std::vector<std::string> argv = {FringeProgram()};
  argv.insert(argv.end(), args.begin(), args.end());
  std::vector<char*> cargv;
  for (std::string& a : argv) cargv.push_back(a.data());
  cargv.push_back(nullptr);
  pid_t pid = -1;
  const int rc =
      ::posix_spawn(&pid, FringeProgram().c_str(), &actions, nullptr, cargv.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (rc != 0) throw std::runtime_error("cannot start " + FringeProgram());
  return pid;
}

}  // namespace

int StartFringe(const std::vector<std::string>& args, const std::string& outPath,
                const std::string& errPath) {
  return Spawn(args, outPath, errPath, "");
}

int WaitFringe(int pid) {
  int status = 0;
  while (::waitpid(pid, &status, 0) < 0 && errno == EINTR) {
  }
  return status;
}

RunOutcome RunFringe(const std::vector<std::string>& args, const std::string& cwd) {
  TempFolder capture;
  const std::string outPath = capture / "stdout", errPath = capture / "stderr";
  const pid_t pid = Spawn(args, outPath, errPath, cwd);
  int status = 0;
  rusage usage{};
  while (::wait4(pid, &status, 0, &usage) < 0 && errno == EINTR) {
  }
  RunOutcome r;
  if (WIFEXITED(status)) r.exitCode = WEXITSTATUS(status);
  if (WIFSIGNALED(status)) r.signal = WTERMSIG(status);
  r.peakKilobytes = usage.ru_maxrss;
  r.out = ReadFile(outPath);
  r.err = ReadFile(errPath);
  return r;
}

}  // namespace FringeTest
