// The module's last analysis answer.
#include "filter/module_result.h"

namespace Project {

AnalysisResult& ModuleAnalysisResult() {
  static AnalysisResult result;
  return result;
}

}  // namespace Project
