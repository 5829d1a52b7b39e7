// What each host procedure does. Every procedure is a plain function the module
// calls with no context: it finds the host of the call in progress, counts the
// call (which may fail it, by the fault plan), and never lets an exception
// escape into the module unless the plan says so. A call arriving when no host is calling the
// module is answered with the procedure's neutral value.
#include "standin/host_procs.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>

#include "standin/fourcc.h"
#include "standin/host.h"
#include "standin/host_abi.h"

namespace Standin {

namespace {

constexpr int16_t kTableVersion = 1;
constexpr int32_t kSuiteUnavailable = -1;

template <typename Function>
void* ToAddress(Function function) {
  void* address = nullptr;
  static_assert(sizeof address == sizeof function);
  std::memcpy(&address, &function, sizeof address);
  return address;
}

}  // namespace

class ProcImpl {
 public:
  // Runs `body` for the current host, or answers `neutral` without one or when
  // the body throws (noted as a problem of the host's own). Only a raise the
  // fault plan asked for leaves a procedure.
  template <typename Result, typename Body>
  static Result Guard(Proc proc, Result neutral, Body body) {
    Host* host = Host::Current();
    if (host == nullptr) return neutral;
    try {
      return body(*host);
    } catch (const HostRaised&) {
      throw;
    } catch (const std::exception& error) {
      host->Note(std::string("the host failed inside ") + ProcName(proc) + ": " + error.what());
    } catch (...) {
      host->Note(std::string("the host failed inside ") + ProcName(proc));
    }
    return neutral;
  }
  template <typename Body>
  static void GuardVoid(Proc proc, Body body) {
    Guard(proc, 0, [&](Host& host) {
      body(host);
      return 0;
    });
  }

  // Filter record callbacks.
  static uint8_t Abort() {
    return Guard<uint8_t>(Proc::Abort, 0, [](Host& host) -> uint8_t {
      ++host.abortCalls_;
      return host.Enter(Proc::Abort) ? 1 : 0;
    });
  }
  static void Progress(int32_t done, int32_t total) {
    GuardVoid(Proc::Progress, [&](Host& host) {
      host.progress_.emplace_back(done, total);
      host.Enter(Proc::Progress);
    });
  }
  static int16_t AdvanceState() {
    return Guard<int16_t>(Proc::AdvanceState, Abi::kParamError, [](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::AdvanceState)) return static_cast<int16_t>(*error);
      return Deliver(host);
    });
  }

  // Handle procedures.
  static Abi::Handle NewHandle(int32_t size) {
    return Guard<Abi::Handle>(Proc::HandleNew, nullptr, [&](Host& host) -> Abi::Handle {
      if (host.Enter(Proc::HandleNew, 0, size)) return nullptr;
      if (size < 0) {
        host.Note("new handle of negative size " + std::to_string(size));
        return nullptr;
      }
      return host.handles_.Create(std::vector<uint8_t>(static_cast<size_t>(size)),
                                  HandleOwner::Module, "new handle");
    });
  }
  static void DisposeHandle(Abi::Handle handle) { Dispose(Proc::HandleDispose, handle); }
  static void ReleaseHandle(Abi::Handle handle) { Dispose(Proc::HandleRelease, handle); }
  static int32_t GetHandleSize(Abi::Handle handle) {
    return Guard<int32_t>(Proc::HandleGetSize, 0, [&](Host& host) -> int32_t {
      if (host.Enter(Proc::HandleGetSize, host.HandleId(handle))) return 0;
      HandleInfo* info = Live(host, Proc::HandleGetSize, handle);
      return info == nullptr ? 0 : static_cast<int32_t>(info->bytes.size());
    });
  }
  static int16_t SetHandleSize(Abi::Handle handle, int32_t size) {
    return Guard<int16_t>(Proc::HandleSetSize, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::HandleSetSize, host.HandleId(handle), size)) {
        return static_cast<int16_t>(*error);
      }
      HandleInfo* info = Live(host, Proc::HandleSetSize, handle);
      if (info == nullptr) return Abi::kNilHandle;
      if (size < 0) return Abi::kParamError;
      if (info->locks > 0) return Abi::kParamError;  // a locked block cannot move
      info->bytes.resize(static_cast<size_t>(size));
      return Abi::kNoError;
    });
  }
  static void* LockHandle(Abi::Handle handle, uint8_t /*moveHigh*/) {
    return Guard<void*>(Proc::HandleLock, nullptr, [&](Host& host) -> void* {
      if (host.Enter(Proc::HandleLock, host.HandleId(handle))) return nullptr;
      HandleInfo* info = Live(host, Proc::HandleLock, handle);
      if (info == nullptr) return nullptr;
      ++info->locks;
      return info->bytes.data();
    });
  }
  static void UnlockHandle(Abi::Handle handle) {
    GuardVoid(Proc::HandleUnlock, [&](Host& host) {
      if (host.Enter(Proc::HandleUnlock, host.HandleId(handle))) return;
      HandleInfo* info = Live(host, Proc::HandleUnlock, handle);
      if (info != nullptr && info->locks > 0) --info->locks;
    });
  }
  static void RecoverSpace(int32_t size) {
    GuardVoid(Proc::HandleRecoverSpace,
              [&](Host& host) { host.Enter(Proc::HandleRecoverSpace, 0, size); });
  }

  // Data-record procedures.
  static int16_t CountRecords(uint32_t type) {
    return Guard<int16_t>(Proc::RecordCount, 0, [&](Host& host) -> int16_t {
      // A failing count answers its error as the count: a host reporting garbage.
      if (auto error = host.Enter(Proc::RecordCount, 0, type)) return static_cast<int16_t>(*error);
      return static_cast<int16_t>(host.document_.Store().Count(type));
    });
  }
  static Abi::Handle GetRecord(uint32_t type, int16_t index) {
    return Guard<Abi::Handle>(Proc::RecordGet, nullptr, [&](Host& host) -> Abi::Handle {
      if (host.Enter(Proc::RecordGet, 0, index)) return nullptr;
      const StoredRecord* record = host.document_.Store().Get(type, index);
      return record == nullptr ? nullptr : host.RecordHandle(*record, type, index);
    });
  }
  // The table's delete answers nothing: a failure can only be seen in the
  // records that are left.
  static void DeleteRecord(uint32_t type, int16_t index) {
    GuardVoid(Proc::RecordDelete, [&](Host& host) {
      if (host.Enter(Proc::RecordDelete, 0, index)) return;
      const StoredRecord* record = host.document_.Store().Get(type, index);
      if (record == nullptr) {
        host.Note("delete of record '" + FourCCText(type) + "' " + std::to_string(index) +
                  ", which does not exist");
        return;
      }
      Forget(host, record->serial);
      host.document_.Store().Delete(type, index);
    });
  }
  static int16_t AddRecord(uint32_t type, Abi::Handle handle) {
    return Guard<int16_t>(Proc::RecordAdd, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::RecordAdd, host.HandleId(handle), type)) {
        return static_cast<int16_t>(*error);
      }
      HandleInfo* info = Live(host, Proc::RecordAdd, handle);
      if (info == nullptr) return Abi::kNilHandle;
      host.document_.Store().Add(type, info->bytes);  // a copy: the caller keeps its handle
      return Abi::kNoError;
    });
  }

  // Property procedures.
  static int16_t GetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t* simple,
                             Abi::Handle* complex) {
    return Guard<int16_t>(Proc::PropertyGet, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::PropertyGet, 0, key)) return static_cast<int16_t>(*error);
      const PropertyValue* value = host.properties_.Find(signature, key, index);
      if (value == nullptr) return Abi::kPropertyUndefined;
      if (simple != nullptr) *simple = value->simple;
      if (value->complex && complex != nullptr) {
        *complex =
            host.handles_.Create(*value->complex, HandleOwner::Module,
                                 "property '" + FourCCText(key) + "' " + std::to_string(index));
      }
      return Abi::kNoError;
    });
  }
  static int16_t SetProperty(uint32_t signature, uint32_t key, int32_t index, intptr_t simple,
                             Abi::Handle complex) {
    return Guard<int16_t>(Proc::PropertySet, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::PropertySet, 0, key)) return static_cast<int16_t>(*error);
      host.properties_.Writes().push_back({signature, key, index, simple, complex != nullptr});
      PropertyValue value{simple, std::nullopt};
      if (complex != nullptr) {
        HandleInfo* info = Live(host, Proc::PropertySet, complex);
        if (info == nullptr) return Abi::kNilHandle;
        value.complex = info->bytes;
      }
      host.properties_.Set(signature, key, index, std::move(value));
      return Abi::kNoError;
    });
  }

  // Buffer procedures of the record.
  static int16_t AllocateBuffer(int32_t size, Abi::BufferId* id) {
    return Guard<int16_t>(Proc::BufferAllocate, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::BufferAllocate, 0, size)) {
        ++host.recordBuffers_.refused;
        return static_cast<int16_t>(*error);
      }
      if (id == nullptr || size < 0) {
        host.Note("allocate buffer with " +
                  std::string(id == nullptr ? "no identifier slot" : "a negative size"));
        return Abi::kParamError;
      }
      auto buffer = MakeBuffer(host, static_cast<uint32_t>(size), host.recordBuffers_);
      if (!buffer) return Abi::kMemoryFull;
      *id = buffer.get();
      host.recordBufferList_.push_back(std::move(buffer));
      return Abi::kNoError;
    });
  }
  static void* LockBuffer(Abi::BufferId id, uint8_t /*moveHigh*/) {
    return Guard<void*>(Proc::BufferLock, nullptr, [&](Host& host) -> void* {
      if (host.Enter(Proc::BufferLock)) return nullptr;
      auto* buffer = FindRecordBuffer(host, Proc::BufferLock, id);
      if (buffer == nullptr) return nullptr;
      ++buffer->locks;
      return buffer->bytes.get();
    });
  }
  static void UnlockBuffer(Abi::BufferId id) {
    GuardVoid(Proc::BufferUnlock, [&](Host& host) {
      if (host.Enter(Proc::BufferUnlock)) return;
      auto* buffer = FindRecordBuffer(host, Proc::BufferUnlock, id);
      if (buffer != nullptr && buffer->locks > 0) --buffer->locks;
    });
  }
  static void FreeBuffer(Abi::BufferId id) {
    GuardVoid(Proc::BufferFree, [&](Host& host) {
      if (host.Enter(Proc::BufferFree)) return;
      if (FindRecordBuffer(host, Proc::BufferFree, id) == nullptr) return;
      Drop(host.recordBufferList_, id, host.recordBuffers_);
    });
  }
  static int32_t BufferSpace() {
    return Guard<int32_t>(Proc::BufferSpace, 0, [](Host& host) -> int32_t {
      if (host.Enter(Proc::BufferSpace)) return 0;
      return static_cast<int32_t>(
          std::min<int64_t>(Space(host, host.recordBuffers_), std::numeric_limits<int32_t>::max()));
    });
  }

  // Descriptor write procedures.
  static Abi::WriteToken OpenWrite() {
    return Guard<Abi::WriteToken>(Proc::DescriptorOpen, nullptr, [](Host& host) -> Abi::WriteToken {
      if (host.Enter(Proc::DescriptorOpen)) return nullptr;
      host.tokens_.push_back(std::make_unique<Host::OpenToken>());
      return host.tokens_.back().get();
    });
  }
  static int16_t CloseWrite(Abi::WriteToken token, Abi::Handle* descriptor) {
    return Guard<int16_t>(Proc::DescriptorClose, Abi::kParamError, [&](Host& host) -> int16_t {
      auto it = FindToken(host, token);
      auto error = host.Enter(Proc::DescriptorClose);
      if (it == host.tokens_.end()) {
        host.Note("close of a descriptor token that is not open");
        return Abi::kParamError;
      }
      // The token is spent whether or not the close succeeds.
      Descriptor built = std::move((*it)->descriptor);
      host.tokens_.erase(it);
      if (error) return static_cast<int16_t>(*error);
      if (descriptor == nullptr) {
        host.Note("close of a descriptor token without a place for the descriptor");
        return Abi::kParamError;
      }
      *descriptor =
          host.handles_.Create(built.Serialize(), HandleOwner::HandedOver, "result descriptor");
      host.events_.back().handle = host.HandleId(*descriptor);
      return Abi::kNoError;
    });
  }
  static int16_t PutInteger(Abi::WriteToken token, uint32_t key, int32_t value) {
    return Guard<int16_t>(Proc::DescriptorPutInteger, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::DescriptorPutInteger, 0, key)) {
        return static_cast<int16_t>(*error);
      }
      auto it = FindToken(host, token);
      if (it == host.tokens_.end()) {
        host.Note("put integer on a descriptor token that is not open");
        return Abi::kParamError;
      }
      (*it)->descriptor.PutInteger(key, value);
      return Abi::kNoError;
    });
  }
  static int16_t PutFloat(Abi::WriteToken token, uint32_t key, const double* value) {
    return Guard<int16_t>(Proc::DescriptorPutFloat, Abi::kParamError, [&](Host& host) -> int16_t {
      if (auto error = host.Enter(Proc::DescriptorPutFloat, 0, key)) {
        return static_cast<int16_t>(*error);
      }
      auto it = FindToken(host, token);
      if (it == host.tokens_.end() || value == nullptr) {
        host.Note(value == nullptr ? "put float without a value"
                                   : "put float on a descriptor token that is not open");
        return Abi::kParamError;
      }
      (*it)->descriptor.PutFloat(key, *value);
      return Abi::kNoError;
    });
  }

  // The basic suite.
  static int32_t AcquireSuite(const char* name, int32_t version, const void** suite) {
    return Guard<int32_t>(Proc::SuiteAcquire, kSuiteUnavailable, [&](Host& host) -> int32_t {
      auto error = host.Enter(Proc::SuiteAcquire, 0, version);
      if (suite == nullptr || name == nullptr) {
        host.Note("acquire suite without a name or a place for the suite");
        return kSuiteUnavailable;
      }
      *suite = nullptr;
      if (error) return *error;
      const void* procs = host.suites_.Acquire(name, version);
      if (procs == nullptr) return kSuiteUnavailable;
      *suite = procs;
      return 0;
    });
  }
  static int32_t ReleaseSuite(const char* name, int32_t version) {
    return Guard<int32_t>(Proc::SuiteRelease, kSuiteUnavailable, [&](Host& host) -> int32_t {
      if (auto error = host.Enter(Proc::SuiteRelease, 0, version)) return *error;
      if (name == nullptr) {
        host.Note("release suite without a name");
        return kSuiteUnavailable;
      }
      if (!host.suites_.Release(name, version)) {
        host.Note("release of suite \"" + std::string(name) + "\" " + std::to_string(version) +
                  ", which was never acquired");
        return kSuiteUnavailable;
      }
      return 0;
    });
  }

  // The buffer suite.
  static void* SuiteNewBuffer(uint32_t* requestedSize, uint32_t minimumSize) {
    return Guard<void*>(Proc::SuiteBufferNew, nullptr, [&](Host& host) -> void* {
      if (host.Enter(Proc::SuiteBufferNew, 0, requestedSize ? *requestedSize : 0)) {
        ++host.suiteBuffers_.refused;
        return nullptr;
      }
      if (requestedSize == nullptr) {
        host.Note("buffer suite new without a size");
        return nullptr;
      }
      int64_t space = Space(host, host.suiteBuffers_);
      uint32_t size = *requestedSize;
      if (size > space) size = minimumSize;
      if (size > space || size > *requestedSize) {
        ++host.suiteBuffers_.refused;
        return nullptr;
      }
      auto buffer = MakeBuffer(host, size, host.suiteBuffers_);
      if (!buffer) return nullptr;
      *requestedSize = size;
      void* address = buffer->bytes.get();
      host.suiteBufferList_.push_back(std::move(buffer));
      return address;
    });
  }
  static void SuiteDisposeBuffer(void** buffer) {
    GuardVoid(Proc::SuiteBufferDispose, [&](Host& host) {
      if (host.Enter(Proc::SuiteBufferDispose)) return;
      if (buffer == nullptr || *buffer == nullptr) return;
      auto& list = host.suiteBufferList_;
      auto it = std::find_if(list.begin(), list.end(),
                             [&](const auto& owned) { return owned->bytes.get() == *buffer; });
      if (it == list.end()) {
        host.Note("buffer suite dispose of a block the host never gave out");
        return;
      }
      host.suiteBuffers_.outstandingBytes -= (*it)->size;
      ++host.suiteBuffers_.disposed;
      list.erase(it);
      *buffer = nullptr;
    });
  }
  static uint32_t SuiteBufferSize(void* buffer) {
    return Guard<uint32_t>(Proc::SuiteBufferSize, 0, [&](Host& host) -> uint32_t {
      if (host.Enter(Proc::SuiteBufferSize)) return 0;
      for (const auto& owned : host.suiteBufferList_) {
        if (owned->bytes.get() == buffer) return owned->size;
      }
      return 0;
    });
  }
  static uint32_t SuiteBufferSpace() {
    return Guard<uint32_t>(Proc::SuiteBufferSpace, 0, [](Host& host) -> uint32_t {
      if (host.Enter(Proc::SuiteBufferSpace)) return 0;
      return static_cast<uint32_t>(Space(host, host.suiteBuffers_));
    });
  }

 private:
  static void Dispose(Proc proc, Abi::Handle handle) {
    GuardVoid(proc, [&](Host& host) {
      if (host.Enter(proc, host.HandleId(handle))) return;
      HandleInfo* info = Live(host, proc, handle);
      if (info == nullptr) return;
      if (info->owner == HandleOwner::Host) {
        host.Note(std::string(ProcName(proc)) + " of a handle the host keeps (" +
                  HandleRegistry::Describe(*info) + ")");
        return;
      }
      std::string problem;
      host.handles_.Dispose(handle, &problem);
    });
  }

  // The live handle, or null after noting what was wrong with it.
  static HandleInfo* Live(Host& host, Proc proc, Abi::Handle handle) {
    std::string problem;
    HandleInfo* info = host.handles_.FindLive(handle, &problem);
    if (info == nullptr) host.Note(std::string(ProcName(proc)) + " of " + problem);
    return info;
  }

  static void Forget(Host& host, uint64_t serial) {
    auto& cache = host.recordHandles_;
    for (auto it = cache.begin(); it != cache.end(); ++it) {
      if (it->first == serial) {
        std::string ignored;
        host.handles_.Dispose(it->second, &ignored);
        cache.erase(it);
        return;
      }
    }
  }

  using TokenList = std::vector<std::unique_ptr<Host::OpenToken>>;
  static TokenList::iterator FindToken(Host& host, Abi::WriteToken token) {
    return std::find_if(host.tokens_.begin(), host.tokens_.end(),
                        [&](const auto& open) { return open.get() == token; });
  }

  static int64_t Space(const Host& host, const BufferUse& use) {
    return std::max<int64_t>(0, int64_t{host.suiteBufferSpace} - use.outstandingBytes);
  }

  static std::unique_ptr<Host::OwnedBuffer> MakeBuffer(Host& host, uint32_t size, BufferUse& use) {
    if (size > Space(host, use)) {
      ++use.refused;
      return nullptr;
    }
    auto buffer = std::make_unique<Host::OwnedBuffer>();
    buffer->bytes.reset(new (std::nothrow) uint8_t[std::max<uint32_t>(size, 1)]);
    if (!buffer->bytes) {
      ++use.refused;
      return nullptr;
    }
    buffer->size = size;
    ++use.made;
    use.outstandingBytes += size;
    return buffer;
  }

  static Host::OwnedBuffer* FindRecordBuffer(Host& host, Proc proc, Abi::BufferId id) {
    for (const auto& owned : host.recordBufferList_) {
      if (owned.get() == id) return owned.get();
    }
    host.Note(std::string(ProcName(proc)) + " of a buffer the host never gave out");
    return nullptr;
  }

  static void Drop(Host::BufferList& list, Abi::BufferId id, BufferUse& use) {
    auto it = std::find_if(list.begin(), list.end(),
                           [&](const auto& owned) { return owned.get() == id; });
    use.outstandingBytes -= (*it)->size;
    ++use.disposed;
    list.erase(it);
  }

  static BufferRequest ReadRequest(const ByteBlock& record, size_t rect, size_t loPlane,
                                   size_t hiPlane) {
    BufferRequest request;
    request.top = record.Get<int16_t>(rect);
    request.left = record.Get<int16_t>(rect + 2);
    request.bottom = record.Get<int16_t>(rect + 4);
    request.right = record.Get<int16_t>(rect + 6);
    request.loPlane = record.Get<int16_t>(loPlane);
    request.hiPlane = record.Get<int16_t>(hiPlane);
    return request;
  }

  // Advance state: the requested rectangles and planes, in fresh buffers.
  static int16_t Deliver(Host& host) {
    namespace F = Abi::Filter;
    ByteBlock& record = host.record_;
    host.input_.reset();
    host.output_.reset();
    host.outputChangeNoted_ = false;
    BufferRequest in = ReadRequest(record, F::kInRect, F::kInLoPlane, F::kInHiPlane);
    BufferRequest out = ReadRequest(record, F::kOutRect, F::kOutLoPlane, F::kOutHiPlane);
    int16_t result =
        FrameBuffer::Build(host.document_, in, host.inputLayout, host.deliveryLimit, &host.input_);
    if (result == 0) {
      result = FrameBuffer::Build(host.document_, out, host.outputLayout, host.deliveryLimit,
                                  &host.output_);
    }
    if (result != 0) {
      host.input_.reset();
      host.output_.reset();
    }
    Delivery delivery;
    if (host.input_) {
      delivery.inData = host.input_->Base();
      delivery.inRowBytes = host.input_->RowBytes();
      delivery.inColumnBytes = host.input_->ColumnBytes();
    }
    if (host.output_) {
      delivery.outData = host.output_->Base();
      delivery.outRowBytes = host.output_->RowBytes();
      delivery.outColumnBytes = host.output_->ColumnBytes();
    }
    delivery.result = result;
    if (host.deliveryHook) host.deliveryHook(delivery, record);
    record.PutPointer(F::kInData, delivery.inData);
    record.Put<int32_t>(F::kInRowBytes, delivery.inRowBytes);
    record.Put<int32_t>(F::kInColumnBytes, delivery.inColumnBytes);
    record.PutPointer(F::kOutData, delivery.outData);
    record.Put<int32_t>(F::kOutRowBytes, delivery.outRowBytes);
    record.Put<int32_t>(F::kOutColumnBytes, delivery.outColumnBytes);
    return delivery.result;
  }
};

std::vector<Proc> HostProcs::TableProcs(Table table) {
  switch (table) {
    case Table::Handle:
      return {Proc::HandleNew,  Proc::HandleDispose, Proc::HandleGetSize,      Proc::HandleSetSize,
              Proc::HandleLock, Proc::HandleUnlock,  Proc::HandleRecoverSpace, Proc::HandleRelease};
    case Table::DataRecord:
      return {Proc::RecordCount, Proc::RecordGet, Proc::RecordDelete, Proc::RecordAdd};
    case Table::Property:
      return {Proc::PropertyGet, Proc::PropertySet};
    case Table::Buffer:
      return {Proc::BufferAllocate, Proc::BufferLock, Proc::BufferUnlock, Proc::BufferFree,
              Proc::BufferSpace};
    case Table::DescriptorWrite:
      return {Proc::DescriptorOpen, Proc::DescriptorClose, Proc::DescriptorPutInteger,
              Proc::DescriptorPutFloat};
    case Table::BasicSuite:
      return {Proc::SuiteAcquire, Proc::SuiteRelease};
    case Table::DescriptorParameters:
    case Table::PlatformData:
      return {};
  }
  return {};
}

void* HostProcs::Address(Proc proc, const FaultPlan& faults) {
  if (faults.Removed(proc)) return nullptr;
  switch (proc) {
    case Proc::Abort:
      return ToAddress(&ProcImpl::Abort);
    case Proc::Progress:
      return ToAddress(&ProcImpl::Progress);
    case Proc::AdvanceState:
      return ToAddress(&ProcImpl::AdvanceState);
    case Proc::HandleNew:
      return ToAddress(&ProcImpl::NewHandle);
    case Proc::HandleDispose:
      return ToAddress(&ProcImpl::DisposeHandle);
    case Proc::HandleGetSize:
      return ToAddress(&ProcImpl::GetHandleSize);
    case Proc::HandleSetSize:
      return ToAddress(&ProcImpl::SetHandleSize);
    case Proc::HandleLock:
      return ToAddress(&ProcImpl::LockHandle);
    case Proc::HandleUnlock:
      return ToAddress(&ProcImpl::UnlockHandle);
    case Proc::HandleRecoverSpace:
      return ToAddress(&ProcImpl::RecoverSpace);
    case Proc::HandleRelease:
      return ToAddress(&ProcImpl::ReleaseHandle);
    case Proc::RecordCount:
      return ToAddress(&ProcImpl::CountRecords);
    case Proc::RecordGet:
      return ToAddress(&ProcImpl::GetRecord);
    case Proc::RecordDelete:
      return ToAddress(&ProcImpl::DeleteRecord);
    case Proc::RecordAdd:
      return ToAddress(&ProcImpl::AddRecord);
    case Proc::PropertyGet:
      return ToAddress(&ProcImpl::GetProperty);
    case Proc::PropertySet:
      return ToAddress(&ProcImpl::SetProperty);
    case Proc::BufferAllocate:
      return ToAddress(&ProcImpl::AllocateBuffer);
    case Proc::BufferLock:
      return ToAddress(&ProcImpl::LockBuffer);
    case Proc::BufferUnlock:
      return ToAddress(&ProcImpl::UnlockBuffer);
    case Proc::BufferFree:
      return ToAddress(&ProcImpl::FreeBuffer);
    case Proc::BufferSpace:
      return ToAddress(&ProcImpl::BufferSpace);
    case Proc::DescriptorOpen:
      return ToAddress(&ProcImpl::OpenWrite);
    case Proc::DescriptorClose:
      return ToAddress(&ProcImpl::CloseWrite);
    case Proc::DescriptorPutInteger:
      return ToAddress(&ProcImpl::PutInteger);
    case Proc::DescriptorPutFloat:
      return ToAddress(&ProcImpl::PutFloat);
    case Proc::SuiteAcquire:
      return ToAddress(&ProcImpl::AcquireSuite);
    case Proc::SuiteRelease:
      return ToAddress(&ProcImpl::ReleaseSuite);
    case Proc::SuiteBufferNew:
      return ToAddress(&ProcImpl::SuiteNewBuffer);
    case Proc::SuiteBufferDispose:
      return ToAddress(&ProcImpl::SuiteDisposeBuffer);
    case Proc::SuiteBufferSize:
      return ToAddress(&ProcImpl::SuiteBufferSize);
    case Proc::SuiteBufferSpace:
      return ToAddress(&ProcImpl::SuiteBufferSpace);
  }
  return nullptr;
}

std::unique_ptr<ByteBlock> HostProcs::BuildTable(Table table, const FaultPlan& faults) {
  const TableShape& shape = faults.Shape(table);
  std::vector<Proc> procs = TableProcs(table);
  if (shape.absent || procs.empty()) return nullptr;
  if (table == Table::BasicSuite) {
    auto block = std::make_unique<ByteBlock>(procs.size() * Abi::kTableProcStride);
    for (size_t i = 0; i < procs.size(); ++i) {
      block->PutPointer(i * Abi::kTableProcStride, Address(procs[i], faults));
    }
    return block;
  }
  auto block =
      std::make_unique<ByteBlock>(Abi::kTableFirstProc + procs.size() * Abi::kTableProcStride);
  block->Put<int16_t>(Abi::kTableVersion, kTableVersion);
  block->Put<int16_t>(Abi::kTableCount, shape.count.value_or(static_cast<int16_t>(procs.size())));
  for (size_t i = 0; i < procs.size(); ++i) {
    block->PutPointer(Abi::kTableFirstProc + i * Abi::kTableProcStride, Address(procs[i], faults));
  }
  return block;
}

std::vector<void*> HostProcs::BufferSuite(const FaultPlan& faults) {
  return {Address(Proc::SuiteBufferNew, faults), Address(Proc::SuiteBufferDispose, faults),
          Address(Proc::SuiteBufferSize, faults), Address(Proc::SuiteBufferSpace, faults)};
}

}  // namespace Standin
