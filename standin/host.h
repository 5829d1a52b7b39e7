// The stand-in host: plays the host's side of a filter run for one loaded
// module and one document. It writes the filter record by byte offset, offers
// every procedure table, delivers the buffers at advance state, keeps the
// document's data records and collects the result descriptor, and watches the
// module: every call counted, every handle tracked, the output buffer checked
// unchanged. Every procedure can be removed or made to fail (Faults()).
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "standin/byte_block.h"
#include "standin/descriptor.h"
#include "standin/document.h"
#include "standin/faults.h"
#include "standin/frame_buffer.h"
#include "standin/handles.h"
#include "standin/module.h"
#include "standin/problems.h"
#include "standin/properties.h"
#include "standin/suites.h"

namespace Standin {

constexpr const char* kBufferSuiteName = "Rastrix Buffer Suite for Plug-ins";
constexpr int32_t kBufferSuiteVersion = 1;

// Selectors of the entry point.
constexpr int16_t kAbout = 0, kParameters = 1, kPrepare = 2, kStart = 3, kContinue = 4, kFinish = 5;

// What advance state is about to hand over. A test's delivery hook may change
// any of it to play a broken host: the values are written into the record as
// they stand, and `result` is what advance state answers.
struct Delivery {
  uint8_t* inData = nullptr;
  int32_t inRowBytes = 0;
  int32_t inColumnBytes = 0;
  uint8_t* outData = nullptr;
  int32_t outRowBytes = 0;
  int32_t outColumnBytes = 0;
  int16_t result = 0;
};

struct RunPlan {
  bool parameters = true;
  bool prepare = true;
  bool start = true;
  int continues = 1;
  bool finish = true;
  // As a host does: a failing parameters, prepare, start or continue ends the
  // run there, without finish. When false every planned selector is sent.
  bool stopOnFailure = true;
};

struct RunReport {
  std::array<int16_t, 6> results{};  // by selector; 0 where not called
  std::array<bool, 6> called{};
  int32_t maxSpaceAfterPrepare = 0;
  int32_t bufferSpaceAfterPrepare = 0;
};

// One procedure call other than the abort test and progress, in order.
struct CallEvent {
  Proc proc = Proc::Abort;
  uint64_t handle = 0;  // the handle's id where the call concerns one
  int64_t value = 0;    // the size, type, key or result, as fits the call
};

// Buffers handed out through the buffer suite or the buffer procedures.
struct BufferUse {
  int32_t made = 0;
  int32_t disposed = 0;
  int32_t refused = 0;
  int64_t outstandingBytes = 0;
  int32_t Outstanding() const { return made - disposed; }
};

class ProcImpl;

class Host {
 public:
  Host(Module& module, Document document);
  ~Host();
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;

  // The host whose call into the module is in progress on this thread.
  static Host* Current();

  Document& Doc() { return document_; }
  ByteBlock& Record() { return record_; }
  ByteBlock& AboutRecord() { return about_; }
  ByteBlock& DescriptorBlock() { return descriptorBlock_; }
  FaultPlan& Faults() { return faults_; }
  HandleRegistry& Handles() { return handles_; }
  PropertyStore& Properties() { return properties_; }
  SuiteRegistry& Suites() { return suites_; }
  ProblemLog& Problems() { return problems_; }
  const ProblemLog& Problems() const { return problems_; }

  BufferLayout inputLayout;
  BufferLayout outputLayout;
  int64_t deliveryLimit = int64_t{3} << 29;  // bytes per delivered buffer
  // Runs after the buffers are made and before they are written into the
  // record; it may also change other fields of the record.
  std::function<void(Delivery&, ByteBlock& record)> deliveryHook;
  uint32_t suiteBufferSpace = 1u << 30;  // what the buffer suite can hand out in all

  // The abort test answers "cancel" at its call number `call` (counted from now)
  // and, when sticky, at every later call.
  void CancelAt(int32_t call, bool sticky = true) {
    faults_.FailAt(Proc::Abort, call, sticky ? -1 : 1);
  }

  // Leaves a descriptor handle in the parameter block, as a host that collected
  // nothing from an earlier write would; the module is to dispose of it.
  Abi::Handle SeedDescriptorHandle(const Descriptor& descriptor);

  // Prepares the record for a new run: clears it, writes the document and every
  // table (shaped by the fault plan), forgets the last run's observations.
  void BeginRun();
  // Calls the entry point once (the about record for selector 0, else the filter
  // record) and answers the result word. After finish it collects the descriptor.
  int16_t Call(int16_t selector);
  // Calls the entry point with any record pointer (null included).
  int16_t CallWithRecord(int16_t selector, void* record);
  // BeginRun, then parameters, prepare, start, continues and finish as planned,
  // then CheckRunEnd.
  RunReport Run(const RunPlan& plan = {});
  // Notes in Problems() what the run left behind: handles, open descriptor
  // tokens, buffers.
  void CheckRunEnd();

  // Observations of the current run.
  const std::vector<std::pair<int32_t, int32_t>>& ProgressCalls() const { return progress_; }
  int32_t AbortCalls() const { return abortCalls_; }
  const std::vector<CallEvent>& Events() const { return events_; }
  const std::optional<Descriptor>& LastDescriptor() const { return descriptor_; }
  const FrameBuffer* Input() const { return input_.get(); }
  const FrameBuffer* Output() const { return output_.get(); }
  BufferUse SuiteBuffers() const { return suiteBuffers_; }
  BufferUse RecordBuffers() const { return recordBuffers_; }
  int32_t Calls(Proc proc) const { return faults_.Calls(proc); }
  std::vector<std::vector<uint8_t>> Records(uint32_t type) const {
    return document_.Store().Records(type);
  }

 private:
  friend struct HostProcs;
  friend class ProcImpl;

  struct OwnedBuffer {
    std::unique_ptr<uint8_t[]> bytes;
    uint32_t size = 0;
    int32_t locks = 0;
  };
  using BufferList = std::vector<std::unique_ptr<OwnedBuffer>>;
  struct OpenToken {
    Descriptor descriptor;
  };

  // Counts a call, logs it, and answers the error to fail it with, if any.
  std::optional<int32_t> Enter(Proc proc, uint64_t handle = 0, int64_t value = 0);
  void Note(std::string problem) { problems_.Add(std::move(problem)); }
  void WriteTables();
  void CollectDescriptor();
  void CheckOutputUnchanged();
  uint64_t HandleId(Abi::Handle handle) const;
  Abi::Handle RecordHandle(const StoredRecord& record, uint32_t type, int32_t index);

  Module& module_;
  Document document_;
  ByteBlock record_{Abi::Filter::kSize};
  ByteBlock about_{Abi::About::kSize};
  ByteBlock descriptorBlock_{Abi::DescriptorParameters::kSize};
  ByteBlock platformData_{Abi::PlatformData::kSize};
  std::array<std::unique_ptr<ByteBlock>, kTableCount> tables_;
  uint8_t pluginReference_ = 0;
  intptr_t dataSlot_ = 0;
  bool outputChangeNoted_ = false;

  FaultPlan faults_;
  HandleRegistry handles_;
  PropertyStore properties_;
  SuiteRegistry suites_;
  ProblemLog problems_;

  std::vector<std::pair<int32_t, int32_t>> progress_;
  int32_t abortCalls_ = 0;
  std::vector<CallEvent> events_;
  std::optional<Descriptor> descriptor_;
  std::unique_ptr<FrameBuffer> input_;
  std::unique_ptr<FrameBuffer> output_;
  std::vector<std::unique_ptr<OpenToken>> tokens_;
  std::vector<std::pair<uint64_t, Abi::Handle>> recordHandles_;  // stored record serial -> handle
  BufferList suiteBufferList_;
  BufferList recordBufferList_;
  BufferUse suiteBuffers_;
  BufferUse recordBuffers_;
};

}  // namespace Standin
