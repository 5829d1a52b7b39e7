// The root of the framework's exceptions. Every exception can describe itself
// with a task (what was being done) and a reason (why it failed), both key
// strings resolved only when shown, and says whether it is silent and whether
// it wants an alert rather than a beep.
#pragma once

#include "core/text.h"

namespace Vireo {

class CException {
 public:
  CException() = default;
  CException(const CException&) = default;
  CException& operator=(const CException&) = default;
  virtual ~CException();

  virtual bool IsSilent() const { return false; }
  virtual bool ShowsAlert() const { return true; }
  virtual void GetTask(CText& task) const;
  virtual void DescribeTask(CText& task) const;
  virtual void SetTask(const CText& /*task*/) {}
  virtual void GetReason(CText& reason) const;
  virtual void DescribeReason(CText& reason) const;
  virtual void SetReason(const CText& /*reason*/) {}
};

}  // namespace Vireo
