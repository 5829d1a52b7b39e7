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
  const auto close = TableProc<CloseWriteDescriptorProc>(writeProcs, 2);
  const auto dispose = TableProc<DisposeHandleProc>(handleProcs, 2);
  bool put = false;
  try {
    put = putKeys != nullptr && putKeys(parameters, token, error);
  } catch (...) {
    // A put that throws out of the host must not cost the host the token it
    // opened; what was written so far is incomplete and is not published.
    if (close != nullptr) {
      HostHandle partial = nullptr;
      close(token, &partial);
      if (partial != nullptr && dispose != nullptr) dispose(partial);
    }
    throw;
  }
  if (HostHandle previous = parameters->descriptor; previous != nullptr) {
    if (dispose != nullptr) dispose(previous);
    parameters->descriptor = nullptr;
  }
  HostHandle written = nullptr;
  error = close != nullptr ? close(token, &written) : int16_t{0};
  parameters->descriptor = written;
  return error == 0 && put;
}

}  // namespace Vireo
