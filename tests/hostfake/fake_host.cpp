// An in-process host for tests of the plug-in object.
#include "fake_host.h"

#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include "host/buffer_suite.h"
#include "host/four_char_code.h"

namespace HostFake {
namespace {

FakeHost* g_active = nullptr;

template <typename Proc>
const void* P(Proc proc) {
  return reinterpret_cast<const void*>(proc);
}

}  // namespace

ProcTable::ProcTable(std::vector<const void*> procs) : bytes_(4 + 8 * procs.size(), 0) {
  const auto count = static_cast<int16_t>(procs.size());
  const int16_t version = 1;
  std::memcpy(bytes_.data(), &version, 2);
  std::memcpy(bytes_.data() + 2, &count, 2);
  for (std::size_t i = 0; i < procs.size(); ++i) {
    std::memcpy(bytes_.data() + 4 + 8 * i, &procs[i], 8);
  }
}

void ProcTable::SetCount(int16_t count) {
  std::memcpy(bytes_.data() + 2, &count, 2);
}

void ProcTable::Remove(int position) {
  const void* none = nullptr;
  std::memcpy(bytes_.data() + 4 + 8 * static_cast<std::size_t>(position - 1), &none, 8);
}

// The procedures handed to the module; each reaches the active host.
struct Procs {
  static int32_t Acquire(const char* name, int32_t version, const void** suite) {
    FakeHost& host = FakeHost::Active();
    host.acquireLog_.push_back(std::string(name) + "/" + std::to_string(version));
    const auto found = host.suites_.find({name, version});
    if (found == host.suites_.end()) return -1;
    *suite = found->second;
    return 0;
  }
  static int32_t Release(const char* name, int32_t version) {
    FakeHost::Active().releaseLog_.push_back(std::string(name) + "/" + std::to_string(version));
    return 0;
  }

  static void* SuiteNew(uint32_t* requestedSize, uint32_t minimumSize) {
    FakeHost& host = FakeHost::Active();
    ++host.bufferSuiteNews_;
    if (host.bufferSuiteFails_ || *requestedSize < minimumSize) return nullptr;
    void* buffer = std::malloc(*requestedSize);
    host.suiteBuffers_.insert(buffer);
    return buffer;
  }
  static void SuiteDispose(void** buffer) {
    FakeHost& host = FakeHost::Active();
    ++host.bufferSuiteDisposes_;
    if (host.suiteBuffers_.erase(*buffer) != 1) {
      ++host.misuses_;  // not one of ours, or given back twice
      return;
    }
    std::free(*buffer);
    *buffer = nullptr;
  }

  static int16_t BufferAllocate(int32_t size, void** id) {
    FakeHost& host = FakeHost::Active();
    host.bufferCalls.emplace_back("allocate", nullptr);
    if (host.bufferAllocateError != 0) return host.bufferAllocateError;
    *id = host.bufferAllocateGivesNull ? nullptr : reinterpret_cast<void*>(0x1000 + size);
    return 0;
  }
  static void* BufferLock(void* id, uint8_t) {
    FakeHost::Active().bufferCalls.emplace_back("lock", id);
    return id;
  }
  static void BufferUnlock(void* id) { FakeHost::Active().bufferCalls.emplace_back("unlock", id); }
  static void BufferFree(void* id) { FakeHost::Active().bufferCalls.emplace_back("free", id); }
  static int32_t BufferSpace() {
    FakeHost::Active().bufferCalls.emplace_back("space", nullptr);
    return FakeHost::Active().bufferSpace;
  }

  static Vireo::HostHandle NewHandle(int32_t size) {
    FakeHost& host = FakeHost::Active();
    auto* key = new char;  // a unique address per handle
    host.handles_[key].bytes.assign(static_cast<std::size_t>(size < 0 ? 0 : size), 0);
    return key;
  }
  static void DisposeHandle(Vireo::HostHandle handle) {
    FakeHost& host = FakeHost::Active();
    if (host.handles_.erase(handle) != 1) {
      ++host.misuses_;
      return;
    }
    delete static_cast<char*>(handle);
  }
  static FakeHost::Handle* Find(Vireo::HostHandle handle) {
    FakeHost& host = FakeHost::Active();
    const auto found = host.handles_.find(handle);
    if (found != host.handles_.end()) return &found->second;
    ++host.misuses_;
    return nullptr;
  }
  static int32_t HandleSize(Vireo::HostHandle handle) {
    const FakeHost::Handle* h = Find(handle);
    return h != nullptr ? static_cast<int32_t>(h->bytes.size()) : 0;
  }
  static int16_t SetHandleSize(Vireo::HostHandle handle, int32_t size) {
    FakeHost::Handle* h = Find(handle);
    if (h == nullptr || size < 0) return -50;
    h->bytes.resize(static_cast<std::size_t>(size));
    return 0;
  }
  static void* LockHandle(Vireo::HostHandle handle, uint8_t) {
    FakeHost::Handle* h = Find(handle);
    if (h == nullptr || h->lockFails) return nullptr;
    ++h->locks;
    // An empty handle still locks: its data pointer is just not to be read.
    return h->bytes.empty() ? static_cast<void*>(h) : h->bytes.data();
  }
  static void UnlockHandle(Vireo::HostHandle handle) {
    FakeHost::Handle* h = Find(handle);
    if (h == nullptr) return;
    if (h->locks == 0) {
      ++FakeHost::Active().badUnlocks_;
    } else {
      --h->locks;
    }
  }
  static void RecoverSpace(int32_t) {}

  static int16_t GetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t* simple,
                             Vireo::HostHandle* complex) {
    FakeHost& host = FakeHost::Active();
    ++host.propertyGets_[key];
    if (signature != Vireo::FourCharCode("9ZKT")) return -1;
    if (key == Vireo::FourCharCode("nusv")) {
      if (!host.volumeCountReadable) return -1;
      *simple = host.volumeCount;
      return 0;
    }
    if (key == Vireo::FourCharCode("svlp")) {
      if (host.volumePathThrows) throw std::runtime_error("volume path unreadable");
      if (index < 0 || static_cast<std::size_t>(index) >= host.volumeHandles.size()) return -1;
      const auto& bytes = host.volumeHandles[static_cast<std::size_t>(index)];
      Vireo::HostHandle handle = NewHandle(static_cast<int32_t>(bytes.size()));
      FakeHost::Handle& h = host.handles_[handle];
      h.bytes = bytes;
      h.lockFails = host.unlockableHandles.count(index) != 0;
      *complex = handle;
      return 0;
    }
    return -1;
  }
  static int16_t SetProperty(uint32_t, uint32_t, int32_t, intptr_t, Vireo::HostHandle) {
    return -1;
  }
};

FakeHost::FakeHost()
    : basicSuite_({P(&Procs::Acquire), P(&Procs::Release)}),
      bufferSuite_({P(&Procs::SuiteNew), P(&Procs::SuiteDispose)}),
      bufferProcs_({P(&Procs::BufferAllocate), P(&Procs::BufferLock), P(&Procs::BufferUnlock),
                    P(&Procs::BufferFree), P(&Procs::BufferSpace)}),
      handleProcs_({P(&Procs::NewHandle), P(&Procs::DisposeHandle), P(&Procs::HandleSize),
                    P(&Procs::SetHandleSize), P(&Procs::LockHandle), P(&Procs::UnlockHandle),
                    P(&Procs::RecoverSpace)}),
      propertyProcs_({P(&Procs::GetProperty), P(&Procs::SetProperty)}) {
  if (g_active != nullptr) throw std::logic_error("one fake host at a time");
  g_active = this;
  // Suites are plain lists of pointers: the table's bytes after its header.
  OfferBufferSuite(true);
  record_.basicSuite = static_cast<const Vireo::BasicSuiteTable*>(
      static_cast<const void*>(static_cast<const unsigned char*>(basicSuite_.Data()) + 4));
  record_.bufferProcs = static_cast<const Vireo::BufferProcTable*>(bufferProcs_.Data());
  record_.handleProcs = static_cast<const Vireo::HandleProcTable*>(handleProcs_.Data());
  record_.propertyProcs = static_cast<const Vireo::PropertyProcTable*>(propertyProcs_.Data());
  record_.pluginRef = &pluginReference_;
}

FakeHost::~FakeHost() {
  for (auto& [handle, data] : handles_) delete static_cast<char*>(handle);
  for (void* buffer : suiteBuffers_) std::free(buffer);
  g_active = nullptr;
}

FakeHost& FakeHost::Active() {
  if (g_active == nullptr) throw std::logic_error("no fake host");
  return *g_active;
}

void FakeHost::OfferSuite(const std::string& name, int32_t version, const void* procedures) {
  suites_[{name, version}] = procedures;
}

void FakeHost::WithdrawSuite(const std::string& name, int32_t version) {
  suites_.erase({name, version});
}

void FakeHost::OfferBufferSuite(bool offered) {
  if (offered) {
    OfferSuite(Vireo::kBufferSuiteName, Vireo::kBufferSuiteVersion,
               static_cast<const unsigned char*>(bufferSuite_.Data()) + 4);
  } else {
    WithdrawSuite(Vireo::kBufferSuiteName, Vireo::kBufferSuiteVersion);
  }
}

int FakeHost::PropertyGets(uint32_t key) const {
  const auto found = propertyGets_.find(key);
  return found == propertyGets_.end() ? 0 : found->second;
}

int FakeHost::LockedHandles() const {
  int locked = 0;
  for (const auto& [handle, data] : handles_) locked += data.locks > 0 ? 1 : 0;
  return locked;
}

}  // namespace HostFake
