// A host for the module's tests, built on the module's own record layout: a
// document with its buffers, the callbacks, and the handle, data-record,
// property, descriptor and suite procedures, every one of which can be
// removed, shortened away or made to fail at its N-th call. One fake host is
// current at a time; the procedures find it through Current().
#pragma once

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "host/filter_record.h"
#include "support/proc_table_bytes.h"

namespace FringeTest {

// Procedures that can be made to fail.
enum class Proc {
  kAdvanceState,
  kNewHandle,
  kLockHandle,
  kAddRecord,
  kGetRecord,
  kOpenDescriptor,
  kCloseDescriptor,
  kPutInteger,
  kPutFloat,
  kGetProperty,
  kAcquireSuite,
};

struct DescriptorKey {
  uint32_t key;
  bool isFloat;
  double floatValue;
  int32_t integerValue;
};

class FakeHost {
 public:
  FakeHost();
  ~FakeHost();
  FakeHost(const FakeHost&) = delete;
  FakeHost& operator=(const FakeHost&) = delete;

  static FakeHost& Current();

  // A document of rows × columns with the given planes and image mode, the
  // filter rectangle covering it, every table installed.
  void SetDocument(int16_t rows, int16_t columns, int16_t planes, uint16_t imageMode);
  // Fills every pixel of the document (interleaved planes, tight rows).
  std::vector<uint8_t>& Pixels() { return pixels_; }

  Vireo::FilterRecord record{};
  Vireo::AboutRecord about{};
  Vireo::DescriptorParameters descriptorParameters{};
  intptr_t dataSlot = 0;

  ProcTableBytes handleProcs{8};
  ProcTableBytes recordProcs{4};
  ProcTableBytes propertyProcs{2};
  ProcTableBytes writeProcs{4};
  SuiteBytes basicSuite{2};

  // The N-th call (from 1) of the procedure fails; 0 never.
  void FailAt(Proc proc, int call, int16_t code = -108) { faults_[proc] = {call, code}; }
  // Fails the named suite's acquisition N times, then grants it.
  void RefuseSuite(const std::string& name, int times) { suiteRefusals_[name] = times; }
  // Offers a suite by name and version.
  void OfferSuite(const std::string& name, int32_t version, const void* suite) {
    suites_[{name, version}] = suite;
  }
  void SetProperty(uint32_t key, intptr_t value) { properties_[key] = value; }
  // The abort test answers true from its N-th call (from 1) on; 0 never.
  int cancelFromCall = 0;

  // What the module did.
  int abortCalls = 0;
  std::vector<std::pair<int32_t, int32_t>> progress;
  int advanceCalls = 0;
  // False: advance state leaves the output column distance at 0, unreported.
  bool reportsOutputColumns = true;
  std::vector<std::string> suiteAcquisitions;  // "name/version"
  std::vector<std::string> suiteReleases;
  std::vector<uint32_t> propertyReads;
  std::vector<DescriptorKey> descriptor;  // keys of the last closed descriptor
  std::vector<std::string> events;        // handle and descriptor events in order
  int handlesCreated = 0;
  int handlesDisposed = 0;
  int doubleDisposals = 0;
  size_t LiveHandles() const { return handles_.size(); }
  bool IsLiveHandle(void* handle) const { return handles_.count(handle) != 0; }
  // A descriptor handle the host handed out, as the module left it.
  void* descriptorHandleBeforeRun = nullptr;

  // The document's data records of a type, in list order; null entries are
  // slots whose get answers null.
  std::vector<std::vector<uint8_t>>& Records(uint32_t type) { return records_[type]; }
  std::set<size_t>& NullSlots() { return nullSlots_; }

  // The module's 'fRNG' record as nine 16-bit values.
  bool FringeRecordValues(int16_t (&values)[9]);

  // Procedures (public so tests can plug them into tables of their own).
  static uint8_t Abort();
  static void Progress(int32_t done, int32_t total);
  static int16_t AdvanceState();
  static void* NewHandle(int32_t size);
  static void DisposeHandle(void* handle);
  static int32_t GetHandleSize(void* handle);
  static int16_t SetHandleSize(void* handle, int32_t size);
  static void* LockHandle(void* handle, uint8_t moveHigh);
  static void UnlockHandle(void* handle);
  static void RecoverSpace(int32_t size);
  static int16_t CountRecords(uint32_t type);
  static void* GetRecord(uint32_t type, int16_t index);
  static void DeleteRecord(uint32_t type, int16_t index);
  static int16_t AddRecord(uint32_t type, void* handle);
  static int16_t GetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t* simple,
                             void** complex);
  static int16_t SetPropertyProc(uint32_t signature, uint32_t key, int32_t index, intptr_t simple,
                                 void* complex);
  static void* OpenDescriptor();
  static int16_t CloseDescriptor(void* token, void** descriptor);
  static int16_t PutInteger(void* token, uint32_t key, int32_t value);
  static int16_t PutFloat(void* token, uint32_t key, const double* value);
  static int32_t AcquireSuite(const char* name, int32_t version, const void** suite);
  static int32_t ReleaseSuite(const char* name, int32_t version);

 private:
  // True when this call of the procedure is the one that fails.
  bool Fails(Proc proc, int16_t& code);

  std::map<Proc, std::pair<int, int16_t>> faults_;
  std::map<Proc, int> calls_;
  std::map<std::string, int> suiteRefusals_;
  std::map<std::pair<std::string, int32_t>, const void*> suites_;
  std::map<uint32_t, intptr_t> properties_;
  std::map<void*, std::vector<uint8_t>> handles_;
  std::set<void*> disposed_;
  std::map<uint32_t, std::vector<std::vector<uint8_t>>> records_;
  std::set<size_t> nullSlots_;
  std::vector<uint8_t> pixels_;
  std::vector<uint8_t> input_;
  std::vector<uint8_t> output_;
  std::vector<DescriptorKey> openDescriptor_;
  bool descriptorOpen_ = false;
  int16_t planes_ = 0;
};

}  // namespace FringeTest
