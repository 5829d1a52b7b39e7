// Framework services: process-wide singletons created on first request and
// destroyed together when the entry point discards the filter object
// (ReleaseServices). Each service whose instance exists is linked into one
// list of live services.
#pragma once

#include <memory>

namespace Vireo {

class CService {
 public:
  CService() = default;
  CService(const CService&) = delete;
  CService& operator=(const CService&) = delete;

 protected:
  virtual ~CService() = default;
  // Puts this service at the head of the list of live services.
  void LinkLive();

 private:
  friend void ReleaseServices();
  // Destroys the instance; the next request creates a new one.
  virtual void ReleaseInstance() = 0;
  CService* next_ = nullptr;
  bool linked_ = false;
};

// Releases every live service, including those created while releasing.
void ReleaseServices();

// True when no service instance exists.
bool NoLiveServices();

template <class T>
class CServiceT final : public CService {
 public:
  // The one instance, created on first request.
  static T& Get() {
    CServiceT& self = Self();
    if (!self.instance_) {
      self.instance_ = std::make_unique<T>();
      self.LinkLive();
    }
    return *self.instance_;
  }

  static bool Exists() { return Self().instance_ != nullptr; }

 private:
  CServiceT() = default;
  static CServiceT& Self() {
    static CServiceT self;
    return self;
  }
  void ReleaseInstance() override {
    // Moved out first so that a destructor asking for this service again
    // creates a fresh instance instead of reaching a dying one.
    std::unique_ptr<T> dying = std::move(instance_);
  }

  std::unique_ptr<T> instance_;
};

}  // namespace Vireo
