// The trace file on POSIX. It lives in a world-writable folder, so it is
// opened without following a symbolic link, must be a regular file of ours,
// and is created private to the user.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/platform.h"

namespace Vireo::Platform {

std::string TraceFilePath(const std::string& conventionalPath) {
  return conventionalPath;
}

bool AppendTraceLine(const std::string& path, const std::string& line, bool replaceExisting) {
  // unlink removes a planted link itself, never what it points to.
  if (replaceExisting) unlink(path.c_str());
  // O_NONBLOCK keeps a planted pipe from blocking the open.
  const int fd =
      open(path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW | O_CLOEXEC | O_NONBLOCK, 0600);
  if (fd < 0) return false;
  struct stat info {};
  bool written = false;
  if (fstat(fd, &info) == 0 && S_ISREG(info.st_mode) && info.st_uid == geteuid()) {
    const ssize_t count = write(fd, line.data(), line.size());
    written = count == static_cast<ssize_t>(line.size());
  }
  close(fd);
  return written;
}

}  // namespace Vireo::Platform
