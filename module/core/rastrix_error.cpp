// CRastrixError and the messages of the host's result codes.
#include "core/rastrix_error.h"

namespace Vireo {

const char* RastrixErrorMessage(int16_t code) {
  switch (code) {
    case -128:
      return "$$$/Vireo/RastrixError/userCanceledErr=The operation was canceled.";
    case -111:
      return "$$$/Vireo/RastrixError/memWZErr=An attempt was made to operate on a free memory "
             "block.";
    case -109:
      return "$$$/Vireo/RastrixError/nilHandleErr=An attempt was made to use a NULL handle.";
    case -108:
      return "$$$/Vireo/RastrixError/memFullErr=There is not enough memory.";
    case -50:
      return "$$$/Vireo/RastrixError/paramErr=There is an error in the parameter list.";
    case -46:
      return "$$$/Vireo/RastrixError/vLckdErr=The disk volume is locked.";
    case -45:
      return "$$$/Vireo/RastrixError/fLckdErr=The file is locked.";
    case -43:
      return "$$$/Vireo/RastrixError/fnfErr=The file or directory could not be found.";
    case -39:
      return "$$$/Vireo/RastrixError/eofErr=The end of the data was prematurely reached.";
    case -36:
      return "$$$/Vireo/RastrixError/ioErr=A file system error has occurred.";
    case -34:
      return "$$$/Vireo/RastrixError/dskFulErr=The disk is full.";
    case -23:
      return "$$$/Vireo/RastrixError/openErr=The requested read or write permission is not "
             "allowed.";
    case -20:
      return "$$$/Vireo/RastrixError/writErr=The data could not be written.";
    case -19:
      return "$$$/Vireo/RastrixError/readErr=The data could not be read.";
    default:
      return "$$$/Vireo/RastrixError/Unknown=An unknown host error has occurred.";
  }
}

void CRastrixError::DescribeReason(CText& reason) const {
  reason = RastrixErrorMessage(code_);
}

}  // namespace Vireo
