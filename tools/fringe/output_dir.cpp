// Writing files below the output folder, never outside it.
#include "output_dir.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <vector>

#include "page_error.h"

namespace Fringe {

namespace {

std::vector<std::string> Components(const std::string& rel) {
  std::vector<std::string> parts;
  std::string part;
  for (char c : rel) {
    if (c == '/') {
      parts.push_back(part);
      part.clear();
    } else {
      part += c;
    }
  }
  parts.push_back(part);
  return parts;
}

[[noreturn]] void Fail(const std::string& path, const std::string& why) {
  throw PageError(ErrorKind::Output, "cannot write " + path + ": " + why);
}

class Fd {
 public:
  explicit Fd(int fd) : fd_(fd) {}
  ~Fd() {
    if (fd_ >= 0) ::close(fd_);
  }
  Fd(const Fd&) = delete;
  Fd& operator=(const Fd&) = delete;
  int get() const { return fd_; }
  int release() {
    int f = fd_;
    fd_ = -1;
    return f;
  }
  void reset(int fd) {
    if (fd_ >= 0) ::close(fd_);
    fd_ = fd;
  }

 private:
  int fd_;
};

std::atomic<unsigned> tempCounter{0};

}  // namespace

bool IsSafeRelativePath(const std::string& rel) {
  if (rel.empty() || rel.front() == '/') return false;
  for (const std::string& p : Components(rel)) {
    if (p.empty() || p == "." || p == "..") return false;
    if (p.find('\0') != std::string::npos) return false;
  }
  return true;
}

OutputDir::OutputDir(const std::string& path) : path_(path) {
  std::error_code ec;
  std::filesystem::create_directories(path, ec);
  if (ec) Fail(path, ec.message());
  fd_ = ::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (fd_ < 0) Fail(path, std::strerror(errno));
}

OutputDir::~OutputDir() {
  if (fd_ >= 0) ::close(fd_);
}

std::string OutputDir::Write(const std::string& rel, const std::function<void(int fd)>& write) {
  const std::string shown = (std::filesystem::path(path_) / rel).string();
  if (!IsSafeRelativePath(rel)) Fail(shown, "the name would leave the output folder");
  const std::vector<std::string> parts = Components(rel);

  // Walk down from the output folder; a symbolic link is never followed, so
  // nothing can lead the file outside.
  Fd dir(::dup(fd_));
  if (dir.get() < 0) Fail(shown, std::strerror(errno));
  for (size_t i = 0; i + 1 < parts.size(); ++i) {
    if (::mkdirat(dir.get(), parts[i].c_str(), 0777) != 0 && errno != EEXIST) {
      Fail(shown, std::strerror(errno));
    }
    const int next =
        ::openat(dir.get(), parts[i].c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
    if (next < 0) {
      Fail(shown, errno == ELOOP || errno == ENOTDIR
                      ? parts[i] + " is not a folder below the output folder"
                      : std::strerror(errno));
    }
    dir.reset(next);
  }

  const std::string& name = parts.back();
  const std::string temp = "." + name + ".fringe-" + std::to_string(::getpid()) + "-" +
                           std::to_string(tempCounter++) + ".part";
  Fd file(::openat(dir.get(), temp.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC,
                   0666));
  if (file.get() < 0) Fail(shown, std::strerror(errno));
  try {
    write(file.get());
  } catch (...) {
    ::unlinkat(dir.get(), temp.c_str(), 0);
    throw;
  }
  if (::close(file.release()) != 0) {
    const int err = errno;
    ::unlinkat(dir.get(), temp.c_str(), 0);
    Fail(shown, std::strerror(err));
  }
  // rename replaces a symbolic link of that name rather than writing through it.
  if (::renameat(dir.get(), temp.c_str(), dir.get(), name.c_str()) != 0) {
    const int err = errno;
    ::unlinkat(dir.get(), temp.c_str(), 0);
    Fail(shown, std::strerror(err));
  }
  return shown;
}

}  // namespace Fringe
