// The descriptor write pass.
#include "host/descriptor_write.h"

#include "core/rastrix_error.h"
#include "host/proc_table.h"

namespace Vireo {

bool WriteDescriptor(const HandleProcTable* handleProcs, DescriptorParameters* parameters,
                     PutDescriptorKeys putKeys, int16_t& error) {
  error = 0;
  if (parameters == nullptr || parameters->writeProcs == nullptr) return false;
  const WriteDescriptorProcTable* writeProcs = parameters->writeProcs;
  const auto open = TableProc<OpenWriteDescriptorProc>(writeProcs, 1);
  void* token = open != nullptr ? open() : nullptr;
  if (token == nullptr) {
    error = kMemFullErr;
    return false;
  }
  const bool put = putKeys != nullptr && putKeys(parameters, token, error);
  if (HostHandle previous = parameters->descriptor; previous != nullptr) {
    if (const auto dispose = TableProc<DisposeHandleProc>(handleProcs, 2)) dispose(previous);
    parameters->descriptor = nullptr;
  }
  HostHandle written = nullptr;
  const auto close = TableProc<CloseWriteDescriptorProc>(writeProcs, 2);
  error = close != nullptr ? close(token, &written) : int16_t{0};
  parameters->descriptor = written;
  return error == 0 && put;
}

}  // namespace Vireo
