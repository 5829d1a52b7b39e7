// The guard around one selector's work: a host code raised as CRastrixError
// goes back to the host unshown; every other failure is shown to the user by
// the reporter and answered with 1.
#pragma once

#include <cstdint>
#include <exception>

#include "core/error.h"
#include "core/rastrix_error.h"
#include "core/reporter.h"
#include "core/service.h"

namespace Vireo {

// Runs work(), which answers the result for a completed selector. A failure
// of the reporter itself leaves the guard; the entry point catches it.
template <typename Work>
int16_t RunSelectorGuarded(Work&& work) {
  int16_t result = 1;
  try {
    try {
      result = work();
    } catch (const CRastrixError& error) {
      return error.Code();
    } catch (const CException&) {
      throw;
    } catch (const std::exception& error) {
      throw CError(error);
    } catch (...) {
      throw CException();
    }
  } catch (const CException& exception) {
    CServiceT<CReporter>::Get().Report(exception);
  } catch (...) {
    CServiceT<CReporter>::Get().ReportDefault();
  }
  return result;
}

}  // namespace Vireo
