// The results file: one JSON line appended per finished page, read back at
// start so that an interrupted batch resumes where it stopped. Each line goes
// out in a single write, so a killed run leaves at most one partial line,
// which is cut off (with a warning) when the file is opened again.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "page_result.h"

namespace Fringe {

class ResultsLog {
 public:
  // Opens (creating) the file for appending and reads what it holds.
  // Throws PageError(Output) naming the file when it cannot be used.
  explicit ResultsLog(const std::string& path);
  ~ResultsLog();
  ResultsLog(const ResultsLog&) = delete;
  ResultsLog& operator=(const ResultsLog&) = delete;

  // Pages already recorded, by file. A page whose last record is an internal
  // failure is not counted as done: it is tried again.
  const std::map<std::string, PageResult>& Done() const { return done_; }
  const std::vector<std::string>& Warnings() const { return warnings_; }

  void Append(const PageResult& result);

 private:
  std::string path_;
  int fd_ = -1;
  std::map<std::string, PageResult> done_;
  std::vector<std::string> warnings_;
};

}  // namespace Fringe
