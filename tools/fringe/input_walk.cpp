// Recursive search of input folders.
#include "input_walk.h"

#include <dirent.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <map>
#include <set>
#include <utility>

namespace Fringe {

namespace {

using DirId = std::pair<dev_t, ino_t>;

std::string Lower(std::string s) {
  for (char& c : s) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return s;
}

// Raster formats that scans come in. libvips also reads tables, matrices and
// documents, which a folder of scans holds for other reasons; such a file is
// still read when named on the command line.
const std::set<std::string>& ImageSuffixes() {
  static const std::set<std::string> suffixes = {
      ".png", ".jpg", ".jpeg", ".jpe", ".jfif", ".tif", ".tiff", ".webp", ".gif",  ".bmp",
      ".pbm", ".pgm", ".ppm",  ".pnm", ".jp2",  ".j2k", ".jxl",  ".heic", ".heif", ".avif"};
  return suffixes;
}

std::string Join(const std::string& dir, const std::string& name) {
  if (dir.empty()) return name;
  return dir.back() == '/' ? dir + name : dir + "/" + name;
}

std::string BaseName(const std::string& path) {
  std::string p = path;
  while (p.size() > 1 && p.back() == '/') p.pop_back();
  const size_t slash = p.rfind('/');
  return slash == std::string::npos ? p : p.substr(slash + 1);
}

std::string WithoutExtension(const std::string& name) {
  const size_t dot = name.rfind('.');
  return dot == std::string::npos || dot == 0 ? name : name.substr(0, dot);
}

class Walker {
 public:
  Walker(std::vector<InputEntry>& out, const std::string& excludeDir) : out_(out) {
    struct stat st {};
    if (!excludeDir.empty() && ::stat(excludeDir.c_str(), &st) == 0) {
      excluded_ = DirId{st.st_dev, st.st_ino};
    }
  }

  void Arg(const std::string& arg) {
    struct stat st {};
    if (::stat(arg.c_str(), &st) != 0) {
      Error(arg, ::lstat(arg.c_str(), &st) == 0 ? "broken symbolic link" : std::strerror(errno));
      return;
    }
    if (S_ISDIR(st.st_mode)) {
      if (visited_.insert({st.st_dev, st.st_ino}).second) Folder(arg, arg, "");
      return;
    }
    // A file named on the command line is tried whatever its name says.
    Page(arg, arg);
  }

 private:
  void Folder(const std::string& path, const std::string& shown, const std::string& rel) {
    DIR* dir = ::opendir(path.c_str());
    if (dir == nullptr) {
      Error(shown, std::string("cannot read folder: ") + std::strerror(errno));
      return;
    }
    std::vector<std::string> names;
    while (const dirent* e = ::readdir(dir)) {
      // Hidden names are left alone, fringe's own temporary files among them.
      if (e->d_name[0] != '.') names.emplace_back(e->d_name);
    }
    ::closedir(dir);
    std::sort(names.begin(), names.end());
    for (const std::string& name : names) {
      const std::string childPath = Join(path, name);
      const std::string childShown = Join(shown, name);
      const std::string childRel = rel.empty() ? name : rel + "/" + name;
      struct stat st {};
      if (::stat(childPath.c_str(), &st) != 0) {
        // A dangling link among many files is not worth a page error unless
        // it looks like an image.
        if (HasImageSuffix(name)) Error(childShown, "broken symbolic link");
        continue;
      }
      if (S_ISDIR(st.st_mode)) {
        // Each folder once: a link back up the tree ends here.
        const DirId id{st.st_dev, st.st_ino};
        if (id != excluded_ && visited_.insert(id).second) {
          Folder(childPath, childShown, childRel);
        }
      } else if (S_ISREG(st.st_mode) && HasImageSuffix(name)) {
        Page(childPath, childShown, childRel);
      }
    }
  }

  void Page(const std::string& path, const std::string& shown, const std::string& rel = "") {
    struct stat st {};
    if (::stat(path.c_str(), &st) == 0) {
      if (!files_.insert({st.st_dev, st.st_ino}).second) return;  // named twice
    }
    const std::string relName = rel.empty() ? BaseName(path) : rel;
    const size_t slash = relName.rfind('/');
    const std::string folder = slash == std::string::npos ? "" : relName.substr(0, slash + 1);
    const std::string name = slash == std::string::npos ? relName : relName.substr(slash + 1);
    // Outputs drop the extension; two inputs differing only in it keep theirs.
    std::string stem = folder + WithoutExtension(name);
    if (stems_.count(stem) != 0) stem = folder + name;
    if (stems_.count(stem) != 0) {
      Error(shown, "its output name " + stem + " is already taken by " + stems_[stem]);
      return;
    }
    stems_[stem] = shown;
    out_.push_back({PageTask{path, shown, stem}, ""});
  }

  void Error(const std::string& shown, const std::string& why) {
    out_.push_back({PageTask{shown, shown, ""}, why});
  }

  std::vector<InputEntry>& out_;
  DirId excluded_{0, 0};
  std::set<DirId> visited_;
  std::set<DirId> files_;
  std::map<std::string, std::string> stems_;
};

}  // namespace

bool HasImageSuffix(const std::string& name) {
  const size_t dot = name.rfind('.');
  if (dot == std::string::npos) return false;
  return ImageSuffixes().count(Lower(name.substr(dot))) != 0;
}

std::vector<InputEntry> ExpandInputs(const std::vector<std::string>& args,
                                     const std::string& excludeDir) {
  std::vector<InputEntry> entries;
  Walker walker(entries, excludeDir);
  for (const std::string& arg : args) walker.Arg(arg);
  return entries;
}

}  // namespace Fringe
