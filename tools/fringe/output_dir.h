// The output folder: every file written below it stays below it. Relative
// paths are checked component by component, folders are created without
// following symbolic links, and each file appears whole (written under a
// temporary name, then renamed) so that an interrupted run leaves no half file.
#pragma once

#include <functional>
#include <string>

namespace Fringe {

class OutputDir {
 public:
  // Creates the folder (and its parents) when missing. Throws PageError(Output).
  explicit OutputDir(const std::string& path);
  ~OutputDir();
  OutputDir(const OutputDir&) = delete;
  OutputDir& operator=(const OutputDir&) = delete;

  const std::string& Path() const { return path_; }

  // Writes relPath (slash-separated, no "..", not absolute) through write,
  // which receives an open descriptor. Returns the path written.
  // Throws PageError(Output) naming the file and the reason.
  std::string Write(const std::string& relPath, const std::function<void(int fd)>& write);

 private:
  std::string path_;
  int fd_ = -1;
};

// True when relPath can be written below an output folder as it stands.
bool IsSafeRelativePath(const std::string& relPath);

}  // namespace Fringe
