// CError, the framework's general error with its own task and reason texts,
// and CAbort, the cancellation of an operation.
#pragma once

#include <exception>

#include "core/exception.h"

namespace Vireo {

class CError : public CException {
 public:
  CError(const CText& task, const CText& reason, bool silent = false, bool alert = true);
  // From 8-bit strings; without it two literals would reach the flags below.
  CError(const char* task, const char* reason, bool silent = false, bool alert = true);
  CError(bool silent, bool alert);
  // Takes over the texts and flags of another exception.
  explicit CError(const CException& other);
  CError(const CText& task, const CException& other);
  // A standard exception's own message is not shown: it is not localised.
  explicit CError(const std::exception& other);

  // The usual way to raise an error with a message: the reason alone.
  static CError WithReason(const CText& reason, bool silent = false, bool alert = true);
  // A task alone, with an empty reason.
  static CError WithTask(const CText& task);

  bool IsSilent() const override { return silent_; }
  bool ShowsAlert() const override { return alert_; }
  void DescribeTask(CText& task) const override { task = task_; }
  void SetTask(const CText& task) override { task_ = task; }
  void DescribeReason(CText& reason) const override { reason = reason_; }
  void SetReason(const CText& reason) override { reason_ = reason; }

 private:
  CText task_;
  CText reason_;
  bool silent_ = false;
  bool alert_ = true;
};

class CAbort : public CException {
 public:
  CAbort(bool silent, bool alert) : silent_(silent), alert_(alert) {}

  bool IsSilent() const override { return silent_; }
  bool ShowsAlert() const override { return alert_; }
  void DescribeTask(CText& task) const override;
  void DescribeReason(CText& reason) const override;

 private:
  bool silent_;
  bool alert_;
};

}  // namespace Vireo
