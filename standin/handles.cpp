// Handle tracking.
#include "standin/handles.h"

namespace Standin {

Abi::Handle HandleRegistry::Create(std::vector<uint8_t> bytes, HandleOwner owner,
                                   std::string origin) {
  auto info = std::make_unique<HandleInfo>();
  info->id = order_.size() + 1;
  info->owner = owner;
  info->origin = std::move(origin);
  info->bytes = std::move(bytes);
  // A handle of 0 bytes still locks to an address of its own.
  if (info->bytes.capacity() == 0) info->bytes.reserve(1);
  // The handle is the address of its record: unique for the registry's life,
  // since records are kept after disposal.
  Abi::Handle handle = info.get();
  order_.push_back(info.get());
  handles_.emplace(handle, std::move(info));
  return handle;
}

HandleInfo* HandleRegistry::Find(Abi::Handle handle) {
  auto it = handles_.find(handle);
  return it == handles_.end() ? nullptr : it->second.get();
}

const HandleInfo* HandleRegistry::Find(Abi::Handle handle) const {
  auto it = handles_.find(handle);
  return it == handles_.end() ? nullptr : it->second.get();
}

HandleInfo* HandleRegistry::FindLive(Abi::Handle handle, std::string* problem) {
  HandleInfo* info = Find(handle);
  if (info == nullptr) {
    *problem = handle == nullptr ? "a null handle" : "a handle the host never gave out";
    return nullptr;
  }
  if (!info->live) {
    *problem = "a disposed handle (" + Describe(*info) + ")";
    return nullptr;
  }
  return info;
}

bool HandleRegistry::Dispose(Abi::Handle handle, std::string* problem) {
  HandleInfo* info = FindLive(handle, problem);
  if (info == nullptr) return false;
  info->live = false;
  info->locks = 0;
  return true;
}

std::vector<HandleInfo*> HandleRegistry::Live(HandleOwner owner) {
  std::vector<HandleInfo*> live;
  for (HandleInfo* info : order_) {
    if (info->live && info->owner == owner) live.push_back(info);
  }
  return live;
}

std::string HandleRegistry::Describe(const HandleInfo& info) {
  return "handle #" + std::to_string(info.id) + " of " + std::to_string(info.bytes.size()) +
         " bytes, " + info.origin;
}

}  // namespace Standin
