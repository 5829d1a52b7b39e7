// CRastrixFilter: life, accessors, default handlers and the six guards.
#include "host/rastrix_filter.h"

#include "core/rastrix_error.h"
#include "host/selector_guard.h"

namespace Vireo {
namespace {

CRastrixFilter* g_currentFilter = nullptr;

// A filter selector without its record cannot do anything the host asked.
void RequireRecord(const void* record) {
  if (record == nullptr) throw CRastrixError(kParamErr);
}

}  // namespace

CRastrixFilter::CRastrixFilter(uint32_t runFlags) : runFlags_(runFlags) {
  g_currentFilter = this;
}

CRastrixFilter::~CRastrixFilter() {
  if (g_currentFilter == this) g_currentFilter = nullptr;
}

CRastrixFilter* CRastrixFilter::Current() {
  return g_currentFilter;
}

FilterRecord& CRastrixFilter::AttachedRecord() const {
  RequireRecord(filterRecord_);
  return *filterRecord_;
}

const BufferProcTable* CRastrixFilter::BufferProcs() const {
  return filterRecord_ != nullptr ? filterRecord_->bufferProcs : nullptr;
}

const DataRecordProcTable* CRastrixFilter::DataRecordProcs() const {
  return filterRecord_ != nullptr ? filterRecord_->dataRecordProcs : nullptr;
}

const HandleProcTable* CRastrixFilter::HandleProcs() const {
  return filterRecord_ != nullptr ? filterRecord_->handleProcs : nullptr;
}

const PropertyProcTable* CRastrixFilter::PropertyProcs() const {
  return filterRecord_ != nullptr ? filterRecord_->propertyProcs : nullptr;
}

AbortProc CRastrixFilter::AbortProcedure() const {
  return filterRecord_ != nullptr ? filterRecord_->abortProc : nullptr;
}

ProgressProc CRastrixFilter::ProgressProcedure() const {
  return filterRecord_ != nullptr ? filterRecord_->progressProc : nullptr;
}

uint32_t CRastrixFilter::HostSignature() const {
  return filterRecord_ != nullptr ? filterRecord_->hostSignature : 0;
}

AdvanceStateProc CRastrixFilter::AdvanceStateProcedure() const {
  return filterRecord_ != nullptr ? filterRecord_->advanceState : nullptr;
}

DescriptorParameters* CRastrixFilter::DescriptorParams() const {
  return filterRecord_ != nullptr ? filterRecord_->descriptorParameters : nullptr;
}

void* CRastrixFilter::PlatformData() const {
  return filterRecord_ != nullptr ? filterRecord_->platformData : CRastrixPlugin::PlatformData();
}

const BasicSuiteTable* CRastrixFilter::BasicSuite() const {
  return filterRecord_ != nullptr ? filterRecord_->basicSuite : CRastrixPlugin::BasicSuite();
}

void* CRastrixFilter::PluginRef() const {
  return filterRecord_ != nullptr ? filterRecord_->pluginRef : CRastrixPlugin::PluginRef();
}

bool CRastrixFilter::IsDialogWanted() const {
  const DescriptorParameters* parameters = DescriptorParams();
  const bool hostAllows = parameters == nullptr || parameters->playInfo == 1;
  return hostAllows && (runFlags_ & kParametersServed) != 0;
}

void CRastrixFilter::SetUpMemory() {
  if (memoryReady_) return;
  PrepareFrameworkMemory();
  memoryReady_ = true;
}

void CRastrixFilter::DoAbout(const AboutRecord* /*record*/, intptr_t* /*dataSlot*/) {
  // The framework's about display belongs to the windowing toolkit.
}

bool CRastrixFilter::DoParameters(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  return true;
}

bool CRastrixFilter::DoPrepare() {
  return true;
}

bool CRastrixFilter::DoStart() {
  return false;
}

bool CRastrixFilter::DoContinue(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  return true;
}

void CRastrixFilter::DoFinish(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {}

void CRastrixFilter::EnterFilterSelector(void* record, intptr_t* dataSlot, int16_t selector) {
  filterRecord_ = static_cast<FilterRecord*>(record);
  dataSlot_ = dataSlot;
  selector_ = selector;
  SetProcessFlags(kServingFilterSelector, 0);
}

int16_t CRastrixFilter::OnAbout(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    AttachAboutRecord(static_cast<const AboutRecord*>(record));
    dataSlot_ = dataSlot;
    selector_ = 0;
    SetProcessFlags(kServingAbout, kServingFilterSelector);
    runFlags_ &= ~kParametersServed;
    RequireRecord(record);
    DoAbout(static_cast<const AboutRecord*>(record), dataSlot);
    SetProcessFlags(0, kServingAbout);
    return 0;
  });
}

int16_t CRastrixFilter::OnParameters(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    EnterFilterSelector(record, dataSlot, 1);
    runFlags_ |= kParametersServed;
    RequireRecord(record);
    return DoParameters(filterRecord_, dataSlot) ? 0 : 1;
  });
}

int16_t CRastrixFilter::OnPrepare(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    EnterFilterSelector(record, dataSlot, 2);
    RequireRecord(record);
    if (NegotiateBufferSpace() && DoPrepare()) return 0;
    runFlags_ &= ~kParametersServed;
    return 1;
  });
}

int16_t CRastrixFilter::OnStart(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    EnterFilterSelector(record, dataSlot, 3);
    RequireRecord(record);
    ReadHostStartFlag();
    SetUpMemory();
    if (DoStart()) return 0;
    runFlags_ &= ~kParametersServed;
    return 1;
  });
}

int16_t CRastrixFilter::OnContinue(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    EnterFilterSelector(record, dataSlot, 4);
    RequireRecord(record);
    return DoContinue(filterRecord_, dataSlot) ? 0 : 1;
  });
}

int16_t CRastrixFilter::OnFinish(void* record, intptr_t* dataSlot) {
  return RunSelectorGuarded([&]() -> int16_t {
    EnterFilterSelector(record, dataSlot, 5);
    RequireRecord(record);
    DoFinish(filterRecord_, dataSlot);
    runFlags_ &= ~kParametersServed;
    return 0;
  });
}

}  // namespace Vireo
