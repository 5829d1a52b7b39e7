// Everything the host noticed a module doing wrong (a leaked handle, a handle
// disposed twice, output pixels changed, a stray procedure call...), kept in the
// order seen so that a test can show it whole.
#pragma once

#include <string>
#include <vector>

namespace Standin {

class ProblemLog {
 public:
  void Add(std::string problem) { problems_.push_back(std::move(problem)); }
  const std::vector<std::string>& All() const { return problems_; }
  bool Empty() const { return problems_.empty(); }
  void Clear() { problems_.clear(); }
  // Every problem on its own line; empty when there is none.
  std::string Text() const {
    std::string text;
    for (const std::string& problem : problems_) text += problem + "\n";
    return text;
  }

 private:
  std::vector<std::string> problems_;
};

}  // namespace Standin
