// CRastrixFilter: the frame's base class for a filter. For each selector it
// attaches the host's record, runs the selector's work inside a guard that
// turns every outcome into the host's 16-bit result, and calls the handler
// the filter class overrides. It also shares out the host's memory budget.
#pragma once

#include <cstdint>

#include "host/rastrix_plugin.h"

namespace Vireo {

// Run flag: the parameters selector has been served in this run.
inline constexpr uint32_t kParametersServed = 1u << 0;

class CRastrixFilter : public CRastrixPlugin {
 public:
  explicit CRastrixFilter(uint32_t runFlags);
  ~CRastrixFilter() override;

  // The one live filter object of a run, or null.
  static CRastrixFilter* Current();

  // Accessors answered from the attached filter record.
  const BufferProcTable* BufferProcs() const override;
  const DataRecordProcTable* DataRecordProcs() const override;
  const HandleProcTable* HandleProcs() const override;
  const PropertyProcTable* PropertyProcs() const override;
  AbortProc AbortProcedure() const override;
  ProgressProc ProgressProcedure() const override;
  uint32_t HostSignature() const override;
  AdvanceStateProc AdvanceStateProcedure() const override;
  DescriptorParameters* DescriptorParams() const override;
  void* PlatformData() const override;
  const BasicSuiteTable* BasicSuite() const override;
  void* PluginRef() const override;

  virtual bool IsDialogWanted() const;
  // Runs the framework's memory set-up once per object.
  virtual void SetUpMemory();
  virtual void DoAbout(const AboutRecord* record, intptr_t* dataSlot);
  FilterRecord* GetFilterRecord() const { return filterRecord_; }
  int16_t GetSelector() const { return selector_; }
  virtual bool DoParameters(FilterRecord* record, intptr_t* dataSlot);
  virtual bool NegotiateBufferSpace();
  virtual bool DoPrepare();
  virtual bool DoStart();
  virtual bool DoContinue(FilterRecord* record, intptr_t* dataSlot);
  virtual void DoFinish(FilterRecord* record, intptr_t* dataSlot);

  // The guards, one per selector; each answers the host's result.
  int16_t OnAbout(void* record, intptr_t* dataSlot);
  int16_t OnParameters(void* record, intptr_t* dataSlot);
  int16_t OnPrepare(void* record, intptr_t* dataSlot);
  int16_t OnStart(void* record, intptr_t* dataSlot);
  int16_t OnContinue(void* record, intptr_t* dataSlot);
  int16_t OnFinish(void* record, intptr_t* dataSlot);

  // Attaches the record before the first guard, so that the properties read
  // at creation reach the host's procedures.
  void AttachFilterRecord(void* record) { filterRecord_ = static_cast<FilterRecord*>(record); }

  uint32_t RunFlags() const { return runFlags_; }
  bool UsesBufferSuite() const { return useBufferSuite_; }
  bool MemoryReady() const { return memoryReady_; }

 protected:
  // The attached filter record; raises the host's parameter error without one.
  FilterRecord& AttachedRecord() const;
  // The framework's memory set-up itself (tile heap and its allocator).
  void PrepareFrameworkMemory();

 private:
  // Stores the record, data slot and selector, and marks a filter selector.
  void EnterFilterSelector(void* record, intptr_t* dataSlot, int16_t selector);

  uint32_t runFlags_;
  FilterRecord* filterRecord_ = nullptr;
  intptr_t* dataSlot_ = nullptr;
  int16_t selector_ = -1;
  bool useBufferSuite_ = true;
  bool memoryReady_ = false;
};

}  // namespace Vireo
