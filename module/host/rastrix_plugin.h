// CRastrixPlugin: the plug-in object, the one place through which the module
// talks to the host beyond the entry point: accessors over the host's
// callback record, guarded wrappers over its procedure tables, the cache of
// host suites, host properties, handles, data records and the host window.
#pragma once

#include <array>
#include <cstdint>

#include "core/process.h"
#include "host/buffer_procs.h"
#include "host/filter_record.h"
#include "host/host_types.h"
#include "host/suite_catalog.h"

namespace Vireo {

// Process flag bits of the plug-in object.
inline constexpr uint32_t kServingFilterSelector = 1u << 3;
inline constexpr uint32_t kServingAbout = 1u << 5;

// Signature of the host properties the frame reads.
inline constexpr uint32_t kHostPropertySignature = 0x395A4B54;  // '9ZKT'

class CRastrixPlugin : public CProcess {
 public:
  CRastrixPlugin();
  ~CRastrixPlugin() override;

  // The live plug-in object, or null.
  static CRastrixPlugin* Current();

  // Callback-record accessors. The plug-in answers the platform data, basic
  // suite and plug-in reference from an attached about record, null otherwise.
  virtual const BufferProcTable* BufferProcs() const { return nullptr; }
  virtual const DataRecordProcTable* DataRecordProcs() const { return nullptr; }
  virtual const HandleProcTable* HandleProcs() const { return nullptr; }
  virtual const PropertyProcTable* PropertyProcs() const { return nullptr; }
  virtual AbortProc AbortProcedure() const { return nullptr; }
  virtual ProgressProc ProgressProcedure() const { return nullptr; }
  virtual uint32_t HostSignature() const { return 0; }
  virtual AdvanceStateProc AdvanceStateProcedure() const { return nullptr; }
  virtual DescriptorParameters* DescriptorParams() const { return nullptr; }
  virtual void* PlatformData() const;
  virtual const BasicSuiteTable* BasicSuite() const;
  virtual void* PluginRef() const;

  // Suites: acquired on first request and cached; a failed acquisition is
  // tried again at the next request.
  const void* Suite(SuiteId id);
  // The cached suite pointer, without trying to acquire it.
  const void* CachedSuite(SuiteId id) const { return suites_.at(static_cast<size_t>(id)); }
  // Releases every cached suite through the basic suite they came from and
  // forgets that basic suite, so that later requests acquire afresh from the
  // record then attached. For an object that outlives the host's run.
  void ReleaseHostSuites();

  // Host properties.
  bool HasPropertyProcs() const;
  bool GetHostProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t& value);
  bool GetHostPropertyHandle(uint32_t signature, uint32_t key, int32_t index, HostHandle& handle);
  bool SetHostProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t value);
  bool SetHostPropertyHandle(uint32_t signature, uint32_t key, int32_t index, HostHandle handle);

  virtual bool SupportsHighDpi() const { return false; }
  virtual void ReadHighDpiProperty(const PropertyProcTable* propertyProcs);
  virtual void ReadHostInterfaceProperties(const PropertyProcTable* propertyProcs);
  // Interface brightness ('UIBR'): 0, 1, 2 or 3; 1 unless the host says otherwise.
  int InterfaceBrightness() const { return interfaceBrightness_; }
  // Light interface ('LGTB').
  bool LightInterface() const { return lightInterface_; }
  // The host's start flag ('zScW'), kept for the windowing toolkit.
  bool HostStartFlag() const { return hostStartFlag_; }
  void ReadHostStartFlag();

  // Host buffers. Allocation raises the host's code, or -108 when no buffer
  // came back or the procedure is missing.
  bool HasBufferProcs() const;
  HostBufferId AllocateHostBuffer(int32_t size);
  void* LockHostBuffer(HostBufferId id, bool moveHigh);
  void UnlockHostBuffer(HostBufferId id);
  void FreeHostBuffer(HostBufferId id);
  int32_t GetHostBufferSpace();

  // Host handles.
  bool HasHandleProcs() const;
  HostHandle NewHostHandle(int32_t size);
  void DisposeHostHandle(HostHandle handle);
  void ReleaseHostHandle(HostHandle handle);
  int32_t GetHostHandleSize(HostHandle handle);
  void SetHostHandleSize(HostHandle handle, int32_t size);
  void* LockHostHandle(HostHandle handle, bool moveHigh);
  void UnlockHostHandle(HostHandle handle);

  // Document data records.
  bool HasDataRecordProcs() const;
  int32_t CountDataRecords(uint32_t type);
  HostHandle GetDataRecord(uint32_t type, int16_t index);
  void DeleteDataRecord(uint32_t type, int16_t index);
  void AddDataRecord(uint32_t type, HostHandle handle);
  // Replaces every record of the type by one record holding the given bytes.
  void PublishDataRecord(uint32_t type, const void* bytes, int32_t size);

  // The host's main window, or null.
  Platform::WindowHandle HostMainWindow();
  Platform::WindowHandle AlertOwnerWindow() override { return HostMainWindow(); }

  bool TranslateKeyString(CText& text) override;
  // Set once the translation suites have been asked for.
  bool TranslationSuitesFetched() const { return translationSuitesFetched_; }
  void SetTranslationSuitesFetched() { translationSuitesFetched_ = true; }

  // Splits the host's memory budget into the framework's part and the filter's.
  virtual bool SplitBufferSpace(uint32_t total, uint32_t& first, uint32_t& second);

  uint32_t ProcessFlags() const { return processFlags_; }

 protected:
  void SetProcessFlags(uint32_t set, uint32_t clear) {
    processFlags_ = (processFlags_ | set) & ~clear;
  }
  void AttachAboutRecord(const AboutRecord* record) { aboutRecord_ = record; }
  const AboutRecord* AttachedAboutRecord() const { return aboutRecord_; }

 private:
  bool GetHostPropertyFrom(const PropertyProcTable* table, uint32_t signature, uint32_t key,
                           int32_t index, intptr_t& value);
  void ReleaseCachedSuites();

  uint32_t processFlags_ = 0;
  const AboutRecord* aboutRecord_ = nullptr;
  bool hostStartFlag_ = false;
  int interfaceBrightness_ = 1;
  bool lightInterface_ = false;
  const BasicSuiteTable* basicSuite_ = nullptr;
  std::array<const void*, static_cast<size_t>(SuiteId::kCount)> suites_{};
  bool translationSuitesFetched_ = false;
};

}  // namespace Vireo
