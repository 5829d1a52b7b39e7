// What every fuzz target checks beyond the sanitizers: a broken invariant
// prints what broke and aborts, which the fuzzer records as a finding and a
// replay reports as a failure.
#pragma once

#include <cstdint>
#include <set>
#include <string>

#include "standin/faults.h"
#include "standin/problems.h"

namespace Fuzz {

[[noreturn]] void Fail(const std::string& what);

inline void Check(bool ok, const std::string& what) {
  if (!ok) Fail(what);
}

// The faults one input put into the host, and what may follow from them.
class RunFaults {
 public:
  RunFaults();
  void Removed(Standin::Proc proc);
  // A procedure that fails (answering `error`, or raising when 0).
  void Failing(Standin::Proc proc, int32_t error);
  void Shaped(Standin::Table table);
  // A code that advance state itself answers.
  void Produces(int16_t code) { codes_.insert(code); }
  // The host may keep an old record beside the new one: its get answered
  // null for a slot (which the module skips, as it must) or its delete,
  // which answers nothing, did nothing.
  bool HostKeepsRecords() const { return hostKeepsRecords_; }

  // A selector's result: 0, 1, or a code that came from the host.
  void CheckResult(int16_t result, const std::string& where) const;
  // Whatever the host noticed. Leaks count only after a run in host order
  // whose disposing procedures all worked: a host that cannot take memory
  // back is not the module's fault.
  void CheckProblems(const Standin::ProblemLog& problems, bool hostOrder,
                     const std::string& where) const;

 private:
  std::set<int32_t> codes_;
  bool disposalBroken_ = false;
  bool closeMissing_ = false;
  bool hostKeepsRecords_ = false;
};

}  // namespace Fuzz
