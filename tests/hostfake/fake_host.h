// An in-process host for tests of the plug-in object: a basic suite handing
// out named suites, a buffer suite that counts its buffers, buffer, handle and
// property procedure tables, and a filter record pointing at all of them.
// Procedure tables are laid out as the host lays them out (16-bit version,
// 16-bit count, 8-byte pointers on 4-byte boundaries). One FakeHost is active
// at a time: the procedures it hands out reach it through a global pointer.
#pragma once

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "host/filter_record.h"

namespace HostFake {

// A procedure table of the host's layout.
class ProcTable {
 public:
  explicit ProcTable(std::vector<const void*> procs);
  const void* Data() const { return bytes_.data(); }
  void SetCount(int16_t count);
  void Remove(int position);  // clears the pointer, keeps the count

 private:
  std::vector<unsigned char> bytes_;
};

class FakeHost {
 public:
  FakeHost();
  ~FakeHost();
  FakeHost(const FakeHost&) = delete;
  FakeHost& operator=(const FakeHost&) = delete;

  // The record every test starts from: all tables attached, budget fields 0.
  Vireo::FilterRecord& Record() { return record_; }

  // ---- Basic suite
  // Offers a suite (a list of procedure pointers) under a name and version.
  void OfferSuite(const std::string& name, int32_t version, const void* procedures);
  void WithdrawSuite(const std::string& name, int32_t version);
  // "name/version" for every acquisition asked for, in order, offered or not.
  const std::vector<std::string>& AcquireLog() const { return acquireLog_; }
  const std::vector<std::string>& ReleaseLog() const { return releaseLog_; }

  // ---- Buffer suite (offered from the start)
  void OfferBufferSuite(bool offered);
  void FailBufferSuiteNew(bool fail) { bufferSuiteFails_ = fail; }
  int BufferSuiteNews() const { return bufferSuiteNews_; }
  int BufferSuiteDisposes() const { return bufferSuiteDisposes_; }
  std::size_t BufferSuiteLive() const { return suiteBuffers_.size(); }

  // ---- Properties: 'nusv' answers `volumeCount`; 'svlp' index i a handle with
  // the bytes of volumeHandles[i] (missing index: the get fails).
  intptr_t volumeCount = 0;
  bool volumeCountReadable = true;
  std::vector<std::vector<unsigned char>> volumeHandles;
  std::set<int> unlockableHandles;  // 'svlp' indexes whose lock gives null
  bool volumePathThrows = false;    // 'svlp' raises a C++ exception (a broken host)
  int PropertyGets(uint32_t key) const;

  // ---- Handles
  std::size_t LiveHandles() const { return handles_.size(); }
  int LockedHandles() const;
  int UnlocksOfUnlockedHandles() const { return badUnlocks_; }
  // Procedures called with a handle or buffer the host never gave out (or
  // already took back).
  int Misuses() const { return misuses_; }

  // ---- Buffer procedures
  ProcTable& BufferProcs() { return bufferProcs_; }
  int16_t bufferAllocateError = 0;
  bool bufferAllocateGivesNull = false;
  int32_t bufferSpace = 1 << 20;
  std::vector<std::pair<std::string, void*>> bufferCalls;  // procedure name and buffer

  // Static entry points the tables point at.
  static FakeHost& Active();

  struct Handle {
    std::vector<unsigned char> bytes;
    int locks = 0;
    bool lockFails = false;
  };

 private:
  friend struct Procs;

  Vireo::FilterRecord record_{};
  ProcTable basicSuite_;
  ProcTable bufferSuite_;
  ProcTable bufferProcs_;
  ProcTable handleProcs_;
  ProcTable propertyProcs_;
  std::map<std::pair<std::string, int32_t>, const void*> suites_;
  std::vector<std::string> acquireLog_;
  std::vector<std::string> releaseLog_;
  bool bufferSuiteFails_ = false;
  int bufferSuiteNews_ = 0;
  int bufferSuiteDisposes_ = 0;
  std::set<void*> suiteBuffers_;
  std::map<void*, Handle> handles_;
  int badUnlocks_ = 0;
  int misuses_ = 0;
  std::map<uint32_t, int> propertyGets_;
  int pluginReference_ = 0;
};

}  // namespace HostFake
