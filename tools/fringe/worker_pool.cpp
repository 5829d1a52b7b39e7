// Spawning worker processes and feeding them pages over pipes.
#include "worker_pool.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <filesystem>
#include <optional>

#include "worker.h"
#include "worker_protocol.h"

extern char** environ;

namespace Fringe {

namespace {

using Clock = std::chrono::steady_clock;

struct Worker {
  pid_t pid = -1;
  int in = -1;   // the worker's standard input
  int out = -1;  // the worker's standard output
  std::string buffer;
  std::optional<size_t> task;
  Clock::time_point deadline;  // when the page in hand has had its time
  std::string fatal;
};

void WriteLine(int fd, const std::string& line) {
  const std::string text = line + "\n";
  size_t done = 0;
  while (done < text.size()) {
    const ssize_t n = ::write(fd, text.data() + done, text.size() - done);
    if (n < 0 && errno == EINTR) continue;
    // A worker that is gone shows up as the end of its output.
    if (n <= 0) return;
    done += static_cast<size_t>(n);
  }
}

std::string DeathReason(int status) {
  if (WIFSIGNALED(status)) {
    return "worker process killed by signal " + std::to_string(WTERMSIG(status)) + " (" +
           strsignal(WTERMSIG(status)) + ")";
  }
  if (WIFEXITED(status)) {
    return "worker process exited with code " + std::to_string(WEXITSTATUS(status));
  }
  return "worker process ended";
}

std::optional<Worker> Spawn(const std::string& setupLine, std::string& error) {
  int toChild[2], fromChild[2];
  if (::pipe2(toChild, O_CLOEXEC) != 0) {
    error = std::strerror(errno);
    return std::nullopt;
  }
  if (::pipe2(fromChild, O_CLOEXEC) != 0) {
    error = std::strerror(errno);
    ::close(toChild[0]);
    ::close(toChild[1]);
    return std::nullopt;
  }
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_adddup2(&actions, toChild[0], STDIN_FILENO);
  posix_spawn_file_actions_adddup2(&actions, fromChild[1], STDOUT_FILENO);
  std::error_code ec;
  const std::string exe = std::filesystem::read_symlink("/proc/self/exe", ec).string();
  std::string arg0 = exe, arg1 = kWorkerCommand;
  char* argv[] = {arg0.data(), arg1.data(), nullptr};
  pid_t pid = -1;
  const int rc = ec ? ENOENT : ::posix_spawn(&pid, exe.c_str(), &actions, nullptr, argv, environ);
  posix_spawn_file_actions_destroy(&actions);
  ::close(toChild[0]);
  ::close(fromChild[1]);
  if (rc != 0) {
    error = std::string("cannot start a worker process: ") + std::strerror(rc);
    ::close(toChild[1]);
    ::close(fromChild[0]);
    return std::nullopt;
  }
  Worker w;
  w.pid = pid;
  w.in = toChild[1];
  w.out = fromChild[0];
  WriteLine(w.in, setupLine);
  return w;
}

int Reap(Worker& w) {
  if (w.in >= 0) ::close(w.in);
  if (w.out >= 0) ::close(w.out);
  w.in = w.out = -1;
  int status = 0;
  while (::waitpid(w.pid, &status, 0) < 0 && errno == EINTR) {
  }
  return status;
}

// Milliseconds until the first worker's page has had its time; -1: no limit.
int PollTimeout(const std::vector<Worker>& pool, int pageTimeout) {
  if (pageTimeout <= 0) return -1;
  std::optional<Clock::time_point> first;
  for (const Worker& w : pool) {
    if (w.task && (!first || w.deadline < *first)) first = w.deadline;
  }
  if (!first) return -1;
  const auto wait = std::chrono::ceil<std::chrono::milliseconds>(*first - Clock::now()).count();
  return static_cast<int>(std::clamp<long long>(wait, 0, 60 * 1000));
}

}  // namespace

WorkerPool::WorkerPool(int workers, std::string modulePath, const PageSettings& settings,
                       int pageTimeout)
    : workers_(workers), setupLine_(SetupLine(modulePath, settings)), pageTimeout_(pageTimeout) {}

void WorkerPool::Run(const std::vector<PageTask>& tasks,
                     const std::function<void(size_t, PageResult)>& done) {
  std::vector<Worker> pool;
  size_t next = 0, finished = 0;

  auto finish = [&](size_t index, PageResult result) {
    result.file = tasks[index].display;
    ++finished;
    done(index, std::move(result));
  };
  // Every new or idle worker gets a page at once, so that each worker that
  // dies takes exactly one page with it and the batch always ends.
  auto feed = [&](Worker& w) {
    if (next < tasks.size()) {
      w.task = next;
      w.deadline = Clock::now() + std::chrono::seconds(pageTimeout_);
      WriteLine(w.in, JobLine(next, tasks[next]));
      ++next;
    }
  };
  auto startWorker = [&]() {
    std::string error;
    std::optional<Worker> w = Spawn(setupLine_, error);
    if (!w) {
      // Without a process there is nowhere to run the page.
      if (next < tasks.size()) {
        const size_t index = next++;
        finish(index, ErrorResult(tasks[index].display, ErrorKind::Internal, error));
      }
      return;
    }
    feed(*w);
    pool.push_back(std::move(*w));
  };

  const size_t count = std::min(tasks.size(), static_cast<size_t>(std::max(1, workers_)));
  for (size_t i = 0; i < count; ++i) startWorker();

  while (finished < tasks.size()) {
    if (pool.empty()) {
      startWorker();
      continue;
    }
    std::vector<pollfd> fds;
    for (const Worker& w : pool) fds.push_back({w.out, POLLIN, 0});
    if (::poll(fds.data(), fds.size(), PollTimeout(pool, pageTimeout_)) < 0) {
      if (errno == EINTR) continue;
      break;
    }
    const Clock::time_point now = Clock::now();
    for (size_t i = pool.size(); i-- > 0;) {
      Worker& w = pool[i];
      if (fds[i].revents == 0) {
        if (pageTimeout_ <= 0 || !w.task || now < w.deadline) continue;
        // Hung, or too slow: the page fails, the batch goes on.
        w.fatal =
            "worker process stopped after " + std::to_string(pageTimeout_) + " s (--page-timeout)";
        ::kill(w.pid, SIGKILL);
        Reap(w);
        finish(*w.task, ErrorResult(tasks[*w.task].display, ErrorKind::Internal,
                                    w.fatal + " while processing this page"));
        pool.erase(pool.begin() + static_cast<std::ptrdiff_t>(i));
        if (next < tasks.size()) startWorker();
        continue;
      }
      char chunk[4096];
      const ssize_t n = ::read(w.out, chunk, sizeof chunk);
      if (n < 0 && errno == EINTR) continue;
      bool broken = n <= 0;
      if (n > 0) {
        w.buffer.append(chunk, static_cast<size_t>(n));
        size_t newline;
        while (!broken && (newline = w.buffer.find('\n')) != std::string::npos) {
          const std::string line = w.buffer.substr(0, newline);
          w.buffer.erase(0, newline + 1);
          try {
            Reply reply = ParseReplyLine(line);
            if (!reply.fatal.empty()) {
              w.fatal = reply.fatal;
              broken = true;
            } else if (w.task && reply.id == w.task) {
              const size_t index = *w.task;
              w.task.reset();
              finish(index, std::move(reply.result));
              feed(w);
            } else {
              w.fatal = "worker process answered for a page it was not given";
              broken = true;
            }
          } catch (const std::exception& e) {
            w.fatal = std::string("unreadable answer from worker process: ") + e.what();
            broken = true;
          }
        }
      }
      if (!broken) continue;
      if (!w.fatal.empty()) ::kill(w.pid, SIGKILL);
      const int status = Reap(w);
      if (w.task) {
        const std::string why = w.fatal.empty() ? DeathReason(status) : w.fatal;
        finish(*w.task, ErrorResult(tasks[*w.task].display, ErrorKind::Internal,
                                    why + " while processing this page"));
      }
      pool.erase(pool.begin() + static_cast<std::ptrdiff_t>(i));
      if (next < tasks.size()) startWorker();
    }
  }
  for (Worker& w : pool) Reap(w);
}

}  // namespace Fringe
