// The host's record keeping around the entry point: writing the record for a
// run, calling the module, and checking what it left behind.
#include "standin/host.h"

#include "standin/fourcc.h"
#include "standin/host_procs.h"

namespace Standin {

namespace {

thread_local Host* g_current = nullptr;

constexpr int16_t kResultSentinel = 0x7EAD;
constexpr intptr_t kDataSlotSentinel = 0x0DA7A51;
constexpr uint32_t kHostSignature = FourCC("RSTX");

// Sets the current host for the duration of one call into the module.
class CurrentHost {
 public:
  explicit CurrentHost(Host* host) : previous_(g_current) { g_current = host; }
  ~CurrentHost() { g_current = previous_; }
  CurrentHost(const CurrentHost&) = delete;
  CurrentHost& operator=(const CurrentHost&) = delete;

 private:
  Host* previous_;
};

}  // namespace

Host::Host(Module& module, Document document) : module_(module), document_(std::move(document)) {
  suites_.Offer(kBufferSuiteName, kBufferSuiteVersion, HostProcs::BufferSuite(faults_));
}

Host::~Host() = default;

Host* Host::Current() {
  return g_current;
}

Abi::Handle Host::SeedDescriptorHandle(const Descriptor& descriptor) {
  Abi::Handle handle =
      handles_.Create(descriptor.Serialize(), HandleOwner::HandedOver, "earlier descriptor");
  descriptorBlock_.PutPointer(Abi::DescriptorParameters::kDescriptor, handle);
  return handle;
}

void Host::WriteTables() {
  for (int t = 0; t < kTableCount; ++t) {
    auto table = static_cast<Table>(t);
    tables_[static_cast<size_t>(t)] = HostProcs::BuildTable(table, faults_);
  }
  if (suites_.Offered(kBufferSuiteName, kBufferSuiteVersion)) {
    suites_.Offer(kBufferSuiteName, kBufferSuiteVersion, HostProcs::BufferSuite(faults_));
  }
}

void Host::BeginRun() {
  // A descriptor the host did not collect last time is the host's to free.
  if (Abi::Handle left = descriptorBlock_.GetPointer(Abi::DescriptorParameters::kDescriptor)) {
    std::string ignored;
    handles_.Dispose(left, &ignored);
  }
  record_.Clear();
  about_.Clear();
  descriptorBlock_.Clear();
  platformData_.Clear();
  progress_.clear();
  abortCalls_ = 0;
  events_.clear();
  descriptor_.reset();
  input_.reset();
  output_.reset();
  tokens_.clear();
  outputChangeNoted_ = false;
  WriteTables();

  auto table = [&](Table t) -> const void* {
    const auto& block = tables_[static_cast<size_t>(t)];
    return block ? block->Data() : nullptr;
  };
  namespace F = Abi::Filter;
  record_.PutPointer(F::kAbortProc, HostProcs::Address(Proc::Abort, faults_));
  record_.PutPointer(F::kProgressProc, HostProcs::Address(Proc::Progress, faults_));
  record_.Put<int16_t>(F::kImageRows, static_cast<int16_t>(document_.height));
  record_.Put<int16_t>(F::kImageColumns, static_cast<int16_t>(document_.width));
  record_.Put<int16_t>(F::kPlanes, document_.planes);
  for (size_t i = 0; i < 4; ++i) {
    record_.Put<int16_t>(F::kFilterRect + 2 * i, static_cast<int16_t>(document_.filterRect[i]));
  }
  record_.Put<int32_t>(F::kMaxSpace, document_.maxSpace);
  record_.Put<int32_t>(F::kBufferSpace, 0);
  record_.Put<uint32_t>(F::kHostSignature, kHostSignature);
  record_.Put<int16_t>(F::kImageMode, document_.imageMode);
  record_.PutPointer(F::kPlatformData,
                     faults_.Shape(Table::PlatformData).absent ? nullptr : platformData_.Data());
  record_.PutPointer(F::kBufferProcs, table(Table::Buffer));
  record_.PutPointer(F::kRecordProcs, table(Table::DataRecord));
  record_.PutPointer(F::kHandleProcs, table(Table::Handle));
  record_.Put<int16_t>(F::kFilterCase, document_.filterCase);
  record_.PutPointer(F::kAdvanceState, HostProcs::Address(Proc::AdvanceState, faults_));
  record_.PutPointer(F::kPropertyProcs, table(Table::Property));
  record_.PutPointer(F::kDescriptorParameters, faults_.Shape(Table::DescriptorParameters).absent
                                                   ? nullptr
                                                   : descriptorBlock_.Data());
  record_.PutPointer(F::kBasicSuite, table(Table::BasicSuite));
  record_.PutPointer(F::kPluginRef, &pluginReference_);

  about_.PutPointer(Abi::About::kPlatformData, record_.GetPointer(F::kPlatformData));
  about_.PutPointer(Abi::About::kBasicSuite, table(Table::BasicSuite));
  about_.PutPointer(Abi::About::kPluginRef, &pluginReference_);

  descriptorBlock_.PutPointer(Abi::DescriptorParameters::kWriteProcs,
                              table(Table::DescriptorWrite));
}

int16_t Host::Call(int16_t selector) {
  return CallWithRecord(selector, selector == kAbout ? about_.Data() : record_.Data());
}

int16_t Host::CallWithRecord(int16_t selector, void* record) {
  int16_t result = kResultSentinel;
  dataSlot_ = kDataSlotSentinel;
  std::string name = "selector " + std::to_string(selector);
  try {
    CurrentHost current(this);
    module_.Call(selector, record, &dataSlot_, &result);
  } catch (...) {
    Note("an exception left the entry point at " + name);
  }
  if (result == kResultSentinel) Note(name + " left the result word unwritten");
  if (dataSlot_ != kDataSlotSentinel) Note(name + " wrote into the data slot");
  CheckOutputUnchanged();
  if (selector == kFinish) CollectDescriptor();
  return result;
}

RunReport Host::Run(const RunPlan& plan) {
  BeginRun();
  RunReport report;
  auto send = [&](int16_t selector) {
    report.called[static_cast<size_t>(selector)] = true;
    int16_t result = Call(selector);
    report.results[static_cast<size_t>(selector)] = result;
    return result == 0 || !plan.stopOnFailure;
  };
  bool going = true;
  if (going && plan.parameters) going = send(kParameters);
  if (going && plan.prepare) {
    going = send(kPrepare);
    report.maxSpaceAfterPrepare = record_.Get<int32_t>(Abi::Filter::kMaxSpace);
    report.bufferSpaceAfterPrepare = record_.Get<int32_t>(Abi::Filter::kBufferSpace);
  }
  if (going && plan.start) going = send(kStart);
  for (int i = 0; going && i < plan.continues; ++i) going = send(kContinue);
  if (going && plan.finish) send(kFinish);
  CheckRunEnd();
  return report;
}

void Host::CheckRunEnd() {
  // Leaks are freed once noted, as a host does at the end of a call, so that a
  // later run reports only its own.
  for (HandleInfo* info : handles_.Live(HandleOwner::Module)) {
    Note("leaked " + HandleRegistry::Describe(*info));
    std::string ignored;
    handles_.Dispose(info, &ignored);
  }
  if (!tokens_.empty()) {
    Note(std::to_string(tokens_.size()) + " descriptor write token(s) opened and never closed");
    tokens_.clear();
  }
  if (suiteBuffers_.Outstanding() > 0) {
    Note(std::to_string(suiteBuffers_.Outstanding()) + " buffer suite block(s) never disposed");
  }
  if (recordBuffers_.Outstanding() > 0) {
    Note(std::to_string(recordBuffers_.Outstanding()) + " host buffer(s) never freed");
  }
}

void Host::CollectDescriptor() {
  if (faults_.Shape(Table::DescriptorParameters).absent) return;
  Abi::Handle handle = descriptorBlock_.GetPointer(Abi::DescriptorParameters::kDescriptor);
  if (handle == nullptr) return;
  descriptorBlock_.PutPointer(Abi::DescriptorParameters::kDescriptor, nullptr);
  std::string problem;
  HandleInfo* info = handles_.FindLive(handle, &problem);
  if (info == nullptr) {
    Note("the descriptor left in the parameter block is " + problem);
    return;
  }
  if (info->owner != HandleOwner::HandedOver) {
    Note("the descriptor left in the parameter block is not one the host made (" +
         HandleRegistry::Describe(*info) + ")");
    return;
  }
  descriptor_ = Descriptor::Parse(info->bytes, &problem);
  if (!descriptor_) Note("the descriptor left in the parameter block is " + problem);
  handles_.Dispose(handle, &problem);
}

void Host::CheckOutputUnchanged() {
  if (!output_ || outputChangeNoted_) return;
  int64_t at = output_->FirstChange(document_);
  if (at >= 0) {
    Note("the output buffer changed at byte " + std::to_string(at));
    outputChangeNoted_ = true;
  }
}

std::optional<int32_t> Host::Enter(Proc proc, uint64_t handle, int64_t value) {
  if (proc != Proc::Abort && proc != Proc::Progress) events_.push_back({proc, handle, value});
  return faults_.Count(proc);
}

uint64_t Host::HandleId(Abi::Handle handle) const {
  const HandleInfo* info = handles_.Find(handle);
  return info == nullptr ? 0 : info->id;
}

Abi::Handle Host::RecordHandle(const StoredRecord& record, uint32_t type, int32_t index) {
  for (const auto& [serial, handle] : recordHandles_) {
    if (serial == record.serial) return handle;
  }
  Abi::Handle handle =
      handles_.Create(record.bytes, HandleOwner::Host,
                      "stored record '" + FourCCText(type) + "' " + std::to_string(index));
  recordHandles_.emplace_back(record.serial, handle);
  return handle;
}

}  // namespace Standin
