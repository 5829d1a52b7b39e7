// A module written inside the test: its entry point runs what the test scripts,
// and reads the host's records by literal byte offsets as a module would, so
// that the host's own layout is checked against the numbers rather than itself.
#pragma once

#include <cstdint>
#include <cstring>
#include <functional>
#include <memory>
#include <vector>

#include "standin/module.h"

namespace Scripted {

using Script = std::function<void(int16_t selector, uint8_t* record, int16_t* result)>;

// The script run by the next calls of the entry point; the result word is 0
// before it runs.
void SetScript(Script script);
std::unique_ptr<Standin::Module> MakeModule();

template <typename T>
T Read(const void* block, size_t offset) {
  T value;
  std::memcpy(&value, static_cast<const uint8_t*>(block) + offset, sizeof(T));
  return value;
}

template <typename T>
void Write(void* block, size_t offset, T value) {
  std::memcpy(static_cast<uint8_t*>(block) + offset, &value, sizeof(T));
}

// The procedure at 1-based `position` of a table of the host (16-bit version,
// 16-bit count, 8-byte pointers from offset 4), typed as F; null when absent.
template <typename F>
F Proc(const void* table, int position) {
  void* address = Read<void*>(table, 4 + 8 * static_cast<size_t>(position - 1));
  F function = nullptr;
  std::memcpy(&function, &address, sizeof function);
  return function;
}

// The procedure pointer stored at `offset` of a record.
template <typename F>
F ProcAt(const void* record, size_t offset) {
  void* address = Read<void*>(record, offset);
  F function = nullptr;
  std::memcpy(&function, &address, sizeof function);
  return function;
}

}  // namespace Scripted

namespace Scripted {

// What a module sees of the host through the filter record, by literal offsets.
class HostSide {
 public:
  explicit HostSide(uint8_t* record) : record_(record) {}
  uint8_t* Record() const { return record_; }
  void* At(size_t offset) const { return Read<void*>(record_, offset); }

  void* HandleTable() const { return At(256); }
  void* RecordTable() const { return At(232); }
  void* PropertyTable() const { return At(392); }
  void* BufferTable() const { return At(224); }
  void* DescriptorBlock() const { return At(432); }
  void* WriteTable() const { return Read<void*>(DescriptorBlock(), 16); }

  void* NewHandle(int32_t size) const { return Proc<void* (*)(int32_t)>(HandleTable(), 1)(size); }
  void DisposeHandle(void* handle) const { Proc<void (*)(void*)>(HandleTable(), 2)(handle); }
  int32_t HandleSize(void* handle) const {
    return Proc<int32_t (*)(void*)>(HandleTable(), 3)(handle);
  }
  int16_t SetHandleSize(void* handle, int32_t size) const {
    return Proc<int16_t (*)(void*, int32_t)>(HandleTable(), 4)(handle, size);
  }
  uint8_t* Lock(void* handle) const {
    return static_cast<uint8_t*>(Proc<void* (*)(void*, uint8_t)>(HandleTable(), 5)(handle, 0));
  }
  void Unlock(void* handle) const { Proc<void (*)(void*)>(HandleTable(), 6)(handle); }
  void ReleaseHandle(void* handle) const { Proc<void (*)(void*)>(HandleTable(), 8)(handle); }

  int16_t CountRecords(uint32_t type) const {
    return Proc<int16_t (*)(uint32_t)>(RecordTable(), 1)(type);
  }
  void* GetRecord(uint32_t type, int16_t index) const {
    return Proc<void* (*)(uint32_t, int16_t)>(RecordTable(), 2)(type, index);
  }
  void DeleteRecord(uint32_t type, int16_t index) const {
    Proc<void (*)(uint32_t, int16_t)>(RecordTable(), 3)(type, index);
  }
  int16_t AddRecord(uint32_t type, void* handle) const {
    return Proc<int16_t (*)(uint32_t, void*)>(RecordTable(), 4)(type, handle);
  }

  // A new handle holding `bytes`, added as a record of `type`, then disposed.
  int16_t Publish(uint32_t type, const std::vector<uint8_t>& bytes) const {
    void* handle = NewHandle(static_cast<int32_t>(bytes.size()));
    std::memcpy(Lock(handle), bytes.data(), bytes.size());
    int16_t error = AddRecord(type, handle);
    Unlock(handle);
    DisposeHandle(handle);
    return error;
  }

  uint8_t Abort() const { return ProcAt<uint8_t (*)()>(record_, 4)(); }
  void Progress(int32_t done, int32_t total) const {
    ProcAt<void (*)(int32_t, int32_t)>(record_, 12)(done, total);
  }
  int16_t AdvanceState() const { return ProcAt<int16_t (*)()>(record_, 280)(); }

  void* OpenWrite() const { return Proc<void* (*)()>(WriteTable(), 1)(); }
  int16_t CloseWrite(void* token, void** descriptor) const {
    return Proc<int16_t (*)(void*, void**)>(WriteTable(), 2)(token, descriptor);
  }
  int16_t PutInteger(void* token, uint32_t key, int32_t value) const {
    return Proc<int16_t (*)(void*, uint32_t, int32_t)>(WriteTable(), 3)(token, key, value);
  }
  int16_t PutFloat(void* token, uint32_t key, double value) const {
    return Proc<int16_t (*)(void*, uint32_t, const double*)>(WriteTable(), 4)(token, key, &value);
  }
  // One write pass into the parameter block's descriptor field.
  int16_t WriteDescriptor(double angle, int32_t confidence) const {
    void* token = OpenWrite();
    PutFloat(token, 0x616E676C /* 'angl' */, angle);
    PutInteger(token, 0x636F6E66 /* 'conf' */, confidence);
    return CloseWrite(token, static_cast<void**>(
                                 static_cast<void*>(static_cast<uint8_t*>(DescriptorBlock()) + 8)));
  }

  int16_t GetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t* simple,
                      void** complex) const {
    return Proc<int16_t (*)(uint32_t, uint32_t, int32_t, intptr_t*, void**)>(PropertyTable(), 1)(
        signature, key, index, simple, complex);
  }
  int16_t SetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t simple) const {
    return Proc<int16_t (*)(uint32_t, uint32_t, int32_t, intptr_t, void*)>(PropertyTable(), 2)(
        signature, key, index, simple, nullptr);
  }

  // The basic suite: a plain list of two pointers (acquire, release).
  int32_t AcquireSuite(const char* name, int32_t version, const void** suite) const {
    void* acquire = Read<void*>(At(464), 0);
    int32_t (*function)(const char*, int32_t, const void**) = nullptr;
    std::memcpy(&function, &acquire, sizeof function);
    return function(name, version, suite);
  }
  int32_t ReleaseSuite(const char* name, int32_t version) const {
    void* release = Read<void*>(At(464), 8);
    int32_t (*function)(const char*, int32_t) = nullptr;
    std::memcpy(&function, &release, sizeof function);
    return function(name, version);
  }

 private:
  uint8_t* record_;
};

}  // namespace Scripted
