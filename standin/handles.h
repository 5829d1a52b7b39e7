// Host handles: memory blocks the host owns and a module reaches only through
// the handle procedures. Every handle is tracked from creation to disposal, and
// a disposed handle is remembered, so that a leak, a second disposal or the use
// of a handle the host never gave out is seen rather than undefined.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "standin/host_abi.h"

namespace Standin {

enum class HandleOwner {
  Module,     // made for the module (new handle, a property value): the module disposes it
  Host,       // the host's own (a stored data record): the module must not dispose it
  HandedOver  // the host's, but the module may dispose it (a descriptor it replaces)
};

struct HandleInfo {
  uint64_t id = 0;  // 1, 2, 3... in order of creation
  HandleOwner owner = HandleOwner::Module;
  std::string origin;  // what it was made for, for messages
  std::vector<uint8_t> bytes;
  int32_t locks = 0;
  bool live = true;
};

class HandleRegistry {
 public:
  Abi::Handle Create(std::vector<uint8_t> bytes, HandleOwner owner, std::string origin);

  // The handle's record, live or disposed; null for a value the host never gave out.
  HandleInfo* Find(Abi::Handle handle);
  const HandleInfo* Find(Abi::Handle handle) const;
  // The live handle's record; null (with `problem` saying why) otherwise.
  HandleInfo* FindLive(Abi::Handle handle, std::string* problem);

  // Ends the handle's life. False with a reason when it is unknown or already gone.
  bool Dispose(Abi::Handle handle, std::string* problem);

  // Live handles of the given owner.
  std::vector<HandleInfo*> Live(HandleOwner owner);
  size_t Created() const { return order_.size(); }

  static std::string Describe(const HandleInfo& info);

 private:
  std::unordered_map<const void*, std::unique_ptr<HandleInfo>> handles_;
  std::vector<HandleInfo*> order_;
};

}  // namespace Standin
