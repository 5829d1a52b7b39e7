// Reading and appending the JSON Lines results file.
#include "results_log.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <sstream>

#include "page_error.h"
#include "result_json.h"

namespace Fringe {

namespace {

[[noreturn]] void Fail(const std::string& path, const std::string& why) {
  throw PageError(ErrorKind::Output, "results file " + path + ": " + why);
}

void WriteAll(int fd, const std::string& text, const std::string& path) {
  size_t done = 0;
  while (done < text.size()) {
    const ssize_t n = ::write(fd, text.data() + done, text.size() - done);
    if (n < 0) {
      if (errno == EINTR) continue;
      Fail(path, std::strerror(errno));
    }
    done += static_cast<size_t>(n);
  }
}

bool ParsesAsResult(const std::string& line) {
  try {
    ResultFromJson(nlohmann::json::parse(line));
    return true;
  } catch (const std::exception&) {
    return false;
  }
}

}  // namespace

ResultsLog::ResultsLog(const std::string& path) : path_(path) {
  fd_ = ::open(path.c_str(), O_RDWR | O_CREAT | O_APPEND | O_CLOEXEC, 0666);
  if (fd_ < 0) Fail(path, std::strerror(errno));

  std::ifstream in(path, std::ios::binary);
  std::stringstream buffer;
  buffer << in.rdbuf();
  const std::string text = buffer.str();
  size_t start = 0, lineNo = 0;
  while (start < text.size()) {
    const size_t end = text.find('\n', start);
    ++lineNo;
    if (end == std::string::npos && !ParsesAsResult(text.substr(start))) {
      // A run killed while writing: the partial line is cut off, so that the
      // page it was for is recorded once, whole, when it is done again.
      warnings_.push_back(path + ":" + std::to_string(lineNo) + ": unfinished last line dropped");
      if (::ftruncate(fd_, static_cast<off_t>(start)) != 0) Fail(path, std::strerror(errno));
      break;
    }
    const std::string line = text.substr(start, end == std::string::npos ? end : end - start);
    if (end == std::string::npos) {
      // A whole record that only lacks its line end (written by hand): kept.
      WriteAll(fd_, "\n", path);
      start = text.size();
    } else {
      start = end + 1;
    }
    if (line.empty()) continue;
    try {
      PageResult r = ResultFromJson(nlohmann::json::parse(line));
      if (r.status == PageStatus::Error && r.errorKind == ErrorKind::Internal) {
        done_.erase(r.file);
      } else {
        done_[r.file] = std::move(r);
      }
    } catch (const std::exception& e) {
      warnings_.push_back(path + ":" + std::to_string(lineNo) + ": line ignored: " + e.what());
    }
  }
}

ResultsLog::~ResultsLog() {
  if (fd_ >= 0) ::close(fd_);
}

void ResultsLog::Append(const PageResult& result) {
  WriteAll(fd_, JsonLine(result) + "\n", path_);
}

}  // namespace Fringe
