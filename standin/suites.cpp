// Suite offers and their acquisition accounting.
#include "standin/suites.h"

#include <algorithm>

namespace Standin {

void SuiteRegistry::Offer(const std::string& name, int32_t version, std::vector<void*> procs) {
  std::unique_ptr<Entry>& entry = offers_[{name, version}];
  if (!entry) entry = std::make_unique<Entry>();
  // At least one slot, so that an offered suite is never a null pointer.
  if (procs.empty()) procs.push_back(nullptr);
  // Same length: updated in place, so that a module holding the suite from an
  // earlier acquisition keeps a valid table.
  if (entry->procs.size() == procs.size()) {
    std::copy(procs.begin(), procs.end(), entry->procs.begin());
  } else {
    entry->procs = std::move(procs);
  }
}

void SuiteRegistry::Withdraw(const std::string& name, int32_t version) {
  offers_.erase({name, version});
}

void SuiteRegistry::RefuseAt(const std::string& name, int32_t version, int32_t failAt,
                             int32_t failTimes) {
  auto it = offers_.find({name, version});
  if (it == offers_.end()) return;
  it->second->refuseAt = it->second->attempts + failAt;
  it->second->refuseTimes = failTimes;
}

const void* SuiteRegistry::Acquire(const std::string& name, int32_t version) {
  Key key{name, version};
  requests_.push_back(key);
  SuiteUse& use = use_[key];
  auto it = offers_.find(key);
  if (it == offers_.end()) {
    ++use.refused;
    return nullptr;
  }
  Entry& entry = *it->second;
  ++entry.attempts;
  if (entry.refuseAt > 0 && entry.attempts >= entry.refuseAt &&
      (entry.refuseTimes < 0 || entry.attempts < entry.refuseAt + entry.refuseTimes)) {
    ++use.refused;
    return nullptr;
  }
  ++use.acquired;
  return entry.procs.data();
}

bool SuiteRegistry::Release(const std::string& name, int32_t version) {
  Key key{name, version};
  releases_.push_back(key);
  auto it = use_.find(key);
  if (it == use_.end() || it->second.acquired == 0) return false;
  ++it->second.released;
  return true;
}

SuiteUse SuiteRegistry::Use(const std::string& name, int32_t version) const {
  auto it = use_.find({name, version});
  return it == use_.end() ? SuiteUse{} : it->second;
}

}  // namespace Standin
