// The plug-in object's cache of host suites, acquired through the basic suite.
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {

const void* CRastrixPlugin::Suite(SuiteId id) {
  const auto slot = static_cast<size_t>(id);
  if (suites_.at(slot) != nullptr) return suites_[slot];
  const SuiteName& suite = SuiteNameOf(id);
  const BasicSuiteTable* basic = nullptr;
  if (suite.identifierNamed) {
    basic = BasicSuite();
  } else {
    if (basicSuite_ == nullptr) basicSuite_ = BasicSuite();
    basic = basicSuite_;
  }
  const auto acquire = SuiteProc<AcquireSuiteProc>(basic, 1);
  if (acquire == nullptr) return nullptr;
  const void* acquired = nullptr;
  if (acquire(suite.name, suite.version, &acquired) == 0) suites_[slot] = acquired;
  return suites_[slot];
}

void CRastrixPlugin::ReleaseCachedSuites() {
  // Suites fetched by identifier did not go through the cached basic suite;
  // they are still released through the record's one rather than kept.
  const BasicSuiteTable* basic = basicSuite_;
  if (basic == nullptr) {
    bool anyHeld = false;
    for (const void* held : suites_) anyHeld = anyHeld || held != nullptr;
    if (!anyHeld) return;
    basic = BasicSuite();
  }
  const auto release = SuiteProc<ReleaseSuiteProc>(basic, 2);
  for (size_t slot = 0; slot < suites_.size(); ++slot) {
    if (suites_[slot] == nullptr) continue;
    suites_[slot] = nullptr;
    const SuiteName& suite = SuiteNameOf(static_cast<SuiteId>(slot));
    if (release != nullptr) release(suite.name, suite.version);
  }
}

void CRastrixPlugin::ReleaseHostSuites() {
  ReleaseCachedSuites();
  basicSuite_ = nullptr;
  translationSuitesFetched_ = false;
}

}  // namespace Vireo
