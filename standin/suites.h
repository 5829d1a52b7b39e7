// The suites the host hands out by name and version through its basic suite.
// The host offers its own buffer suite; anything else (key-string suites, a
// suite a test wants to see acquired) is offered here as a list of procedure
// pointers, and each offer can be made to refuse acquisition.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace Standin {

struct SuiteUse {
  int32_t acquired = 0;  // successful acquisitions
  int32_t refused = 0;   // acquisitions answered with an error
  int32_t released = 0;
};

class SuiteRegistry {
 public:
  // Offers a suite, or replaces the procedures of one already offered (keeping
  // its refusal schedule). The list is copied; null entries stand for
  // procedures the suite lacks.
  void Offer(const std::string& name, int32_t version, std::vector<void*> procs);
  bool Offered(const std::string& name, int32_t version) const {
    return offers_.count({name, version}) != 0;
  }
  void Withdraw(const std::string& name, int32_t version);
  // Acquisitions number failAt, failAt + 1, ... (failTimes of them, all when
  // negative) of this suite are refused.
  void RefuseAt(const std::string& name, int32_t version, int32_t failAt, int32_t failTimes = 1);

  // The suite's procedure list, counting the attempt; null when not offered or refused.
  const void* Acquire(const std::string& name, int32_t version);
  // False when the suite was never acquired.
  bool Release(const std::string& name, int32_t version);

  SuiteUse Use(const std::string& name, int32_t version) const;
  // Every name and version asked for, in order, offered or not.
  const std::vector<std::pair<std::string, int32_t>>& Requests() const { return requests_; }
  const std::vector<std::pair<std::string, int32_t>>& Releases() const { return releases_; }

 private:
  struct Entry {
    std::vector<void*> procs;
    int32_t attempts = 0;
    int32_t refuseAt = 0;
    int32_t refuseTimes = 0;
  };
  using Key = std::pair<std::string, int32_t>;
  std::map<Key, std::unique_ptr<Entry>> offers_;
  std::map<Key, SuiteUse> use_;
  std::vector<Key> requests_;
  std::vector<Key> releases_;
};

}  // namespace Standin
