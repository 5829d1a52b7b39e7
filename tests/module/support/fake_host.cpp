// The fake host's procedures and bookkeeping.
#include "support/fake_host.h"

#include <cstring>
#include <stdexcept>

#include "host/four_char_code.h"

namespace FringeTest {
namespace {

FakeHost* g_current = nullptr;
uintptr_t g_nextHandle = 0x10000;

std::string SuiteKey(const char* name, int32_t version) {
  return std::string(name) + "/" + std::to_string(version);
}

}  // namespace

FakeHost::FakeHost() {
  if (g_current != nullptr) throw std::logic_error("one fake host at a time");
  g_current = this;

  handleProcs.Set(1, &NewHandle);
  handleProcs.Set(2, &DisposeHandle);
  handleProcs.Set(3, &GetHandleSize);
  handleProcs.Set(4, &SetHandleSize);
  handleProcs.Set(5, &LockHandle);
  handleProcs.Set(6, &UnlockHandle);
  handleProcs.Set(7, &RecoverSpace);
  handleProcs.Set(8, &DisposeHandle);
  recordProcs.Set(1, &CountRecords);
  recordProcs.Set(2, &GetRecord);
  recordProcs.Set(3, &DeleteRecord);
  recordProcs.Set(4, &AddRecord);
  propertyProcs.Set(1, &GetProperty);
  propertyProcs.Set(2, &SetPropertyProc);
  writeProcs.Set(1, &OpenDescriptor);
  writeProcs.Set(2, &CloseDescriptor);
  writeProcs.Set(3, &PutInteger);
  writeProcs.Set(4, &PutFloat);
  basicSuite.Set(1, &AcquireSuite);
  basicSuite.Set(2, &ReleaseSuite);

  record.abortProc = &Abort;
  record.progressProc = &Progress;
  record.advanceState = &AdvanceState;
  record.handleProcs = handleProcs.As<Vireo::HandleProcTable>();
  record.dataRecordProcs = recordProcs.As<Vireo::DataRecordProcTable>();
  record.propertyProcs = propertyProcs.As<Vireo::PropertyProcTable>();
  record.basicSuite = static_cast<const Vireo::BasicSuiteTable*>(basicSuite.Data());
  record.descriptorParameters = &descriptorParameters;
  descriptorParameters.writeProcs = writeProcs.As<Vireo::WriteDescriptorProcTable>();
  about.basicSuite = record.basicSuite;
}

FakeHost::~FakeHost() {
  g_current = nullptr;
}

FakeHost& FakeHost::Current() {
  if (g_current == nullptr) throw std::logic_error("no fake host");
  return *g_current;
}

void FakeHost::SetDocument(int16_t rows, int16_t columns, int16_t planes, uint16_t imageMode) {
  record.documentSize = {rows, columns};
  record.planes = planes;
  record.imageMode = imageMode;
  record.filterRect = {0, 0, rows, columns};
  record.maxSpace = 64 * 1024 * 1024;
  record.filterCase = 1;
  planes_ = planes;
  pixels_.assign(
      static_cast<size_t>(rows) * static_cast<size_t>(columns) * static_cast<size_t>(planes), 255);
}

bool FakeHost::FringeRecordValues(int16_t (&values)[9]) {
  const auto& list = records_[Vireo::FourCharCode("fRNG")];
  if (list.size() != 1 || list[0].size() != sizeof values) return false;
  std::memcpy(values, list[0].data(), sizeof values);
  return true;
}

bool FakeHost::Fails(Proc proc, int16_t& code) {
  const int call = ++calls_[proc];
  const auto fault = faults_.find(proc);
  if (fault == faults_.end() || fault->second.first != call) return false;
  code = fault->second.second;
  return true;
}

uint8_t FakeHost::Abort() {
  FakeHost& host = Current();
  ++host.abortCalls;
  return host.cancelFromCall != 0 && host.abortCalls >= host.cancelFromCall ? 1 : 0;
}

void FakeHost::Progress(int32_t done, int32_t total) {
  Current().progress.emplace_back(done, total);
}

int16_t FakeHost::AdvanceState() {
  FakeHost& host = Current();
  ++host.advanceCalls;
  int16_t code = 0;
  if (host.Fails(Proc::kAdvanceState, code)) return code;
  Vireo::FilterRecord& r = host.record;
  const int columns = r.documentSize.h;
  const int planes = host.planes_;
  const int width = r.inRect.right - r.inRect.left;
  const int height = r.inRect.bottom - r.inRect.top;
  const int delivered = r.inHiPlane - r.inLoPlane + 1;
  host.input_.assign(static_cast<size_t>(width) * height * delivered, 0);
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) {
      for (int p = 0; p < delivered; ++p) {
        const size_t from =
            (static_cast<size_t>(r.inRect.top + y) * columns + r.inRect.left + x) * planes +
            r.inLoPlane + p;
        host.input_[(static_cast<size_t>(y) * width + x) * delivered + p] = host.pixels_[from];
      }
    }
  }
  host.output_ = host.input_;
  r.inData = host.input_.data();
  r.outData = host.output_.data();
  r.inRowBytes = width * delivered;
  r.outRowBytes = width * delivered;
  r.inColumnBytes = delivered;
  r.outColumnBytes = host.reportsOutputColumns ? delivered : 0;
  return 0;
}

void* FakeHost::NewHandle(int32_t size) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kNewHandle, code) || size < 0) return nullptr;
  void* handle = reinterpret_cast<void*>(g_nextHandle);
  g_nextHandle += 16;
  host.handles_[handle].assign(static_cast<size_t>(size), 0);
  ++host.handlesCreated;
  return handle;
}

void FakeHost::DisposeHandle(void* handle) {
  FakeHost& host = Current();
  host.events.push_back("dispose " + std::to_string(reinterpret_cast<uintptr_t>(handle)));
  if (host.handles_.erase(handle) == 0) {
    ++host.doubleDisposals;
    return;
  }
  ++host.handlesDisposed;
}

int32_t FakeHost::GetHandleSize(void* handle) {
  const auto found = Current().handles_.find(handle);
  return found == Current().handles_.end() ? 0 : static_cast<int32_t>(found->second.size());
}

int16_t FakeHost::SetHandleSize(void* handle, int32_t size) {
  const auto found = Current().handles_.find(handle);
  if (found == Current().handles_.end() || size < 0) return -109;
  found->second.resize(static_cast<size_t>(size));
  return 0;
}

void* FakeHost::LockHandle(void* handle, uint8_t /*moveHigh*/) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kLockHandle, code)) return nullptr;
  const auto found = host.handles_.find(handle);
  return found == host.handles_.end() ? nullptr : found->second.data();
}

void FakeHost::UnlockHandle(void* /*handle*/) {}

void FakeHost::RecoverSpace(int32_t /*size*/) {}

int16_t FakeHost::CountRecords(uint32_t type) {
  return static_cast<int16_t>(Current().records_[type].size());
}

void* FakeHost::GetRecord(uint32_t type, int16_t index) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kGetRecord, code)) return nullptr;
  const auto& list = host.records_[type];
  if (index < 1 || static_cast<size_t>(index) > list.size()) return nullptr;
  if (host.nullSlots_.count(static_cast<size_t>(index)) != 0) return nullptr;
  // The host's own block: any non-null token will do for the module.
  return const_cast<uint8_t*>(list[static_cast<size_t>(index) - 1].data());
}

void FakeHost::DeleteRecord(uint32_t type, int16_t index) {
  auto& list = Current().records_[type];
  if (index < 1 || static_cast<size_t>(index) > list.size()) return;
  list.erase(list.begin() + (index - 1));
  Current().events.push_back("delete " + std::to_string(index));
}

int16_t FakeHost::AddRecord(uint32_t type, void* handle) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kAddRecord, code)) return code;
  const auto found = host.handles_.find(handle);
  if (found == host.handles_.end()) return -109;
  host.records_[type].push_back(found->second);
  return 0;
}

int16_t FakeHost::GetProperty(uint32_t signature, uint32_t key, int32_t /*index*/, intptr_t* simple,
                              void** complex) {
  FakeHost& host = Current();
  host.propertyReads.push_back(key);
  int16_t code = 0;
  if (host.Fails(Proc::kGetProperty, code)) return code;
  if (signature != Vireo::FourCharCode("9ZKT")) return -1;
  const auto found = host.properties_.find(key);
  if (found == host.properties_.end()) return -1;
  *simple = found->second;
  *complex = nullptr;
  return 0;
}

int16_t FakeHost::SetPropertyProc(uint32_t /*signature*/, uint32_t key, int32_t /*index*/,
                                  intptr_t simple, void* /*complex*/) {
  Current().properties_[key] = simple;
  return 0;
}

void* FakeHost::OpenDescriptor() {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kOpenDescriptor, code)) return nullptr;
  host.openDescriptor_.clear();
  host.descriptorOpen_ = true;
  return &host.openDescriptor_;
}

int16_t FakeHost::CloseDescriptor(void* token, void** descriptor) {
  FakeHost& host = Current();
  host.events.push_back("close");
  if (token != &host.openDescriptor_ || !host.descriptorOpen_) return -50;
  host.descriptorOpen_ = false;
  int16_t code = 0;
  if (host.Fails(Proc::kCloseDescriptor, code)) return code;
  host.descriptor = host.openDescriptor_;
  *descriptor = NewHandle(static_cast<int32_t>(host.descriptor.size()));
  return 0;
}

int16_t FakeHost::PutInteger(void* token, uint32_t key, int32_t value) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kPutInteger, code)) return code;
  if (token != &host.openDescriptor_) return -50;
  host.openDescriptor_.push_back({key, false, 0.0, value});
  return 0;
}

int16_t FakeHost::PutFloat(void* token, uint32_t key, const double* value) {
  FakeHost& host = Current();
  int16_t code = 0;
  if (host.Fails(Proc::kPutFloat, code)) return code;
  if (token != &host.openDescriptor_) return -50;
  host.openDescriptor_.push_back({key, true, *value, 0});
  return 0;
}

int32_t FakeHost::AcquireSuite(const char* name, int32_t version, const void** suite) {
  FakeHost& host = Current();
  host.suiteAcquisitions.push_back(SuiteKey(name, version));
  int16_t code = 0;
  if (host.Fails(Proc::kAcquireSuite, code)) return code;
  if (auto refusal = host.suiteRefusals_.find(name);
      refusal != host.suiteRefusals_.end() && refusal->second > 0) {
    --refusal->second;
    return -1;
  }
  const auto found = host.suites_.find({name, version});
  if (found == host.suites_.end()) return -1;
  *suite = found->second;
  return 0;
}

int32_t FakeHost::ReleaseSuite(const char* name, int32_t version) {
  Current().suiteReleases.push_back(SuiteKey(name, version));
  return 0;
}

}  // namespace FringeTest
