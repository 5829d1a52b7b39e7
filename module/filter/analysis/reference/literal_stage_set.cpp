// The literal stage set.
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {

const StageSet& LiteralStages() {
  static constexpr StageSet kStages{ComputeProfiles, BuildEdgeMap, FindEdgePoints, EstimateAngle,
                                    FitBox};
  return kStages;
}

}  // namespace Project::Reference
