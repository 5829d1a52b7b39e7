// Putting the result keys into the descriptor.
#include "filter/result_keys.h"

#include "filter/module_result.h"
#include "host/four_char_code.h"
#include "host/proc_table.h"

namespace Project {

using Vireo::FourCharCode;

bool PutResultKeysFrom(const AnalysisResult& result, Vireo::DescriptorParameters* parameters,
                       void* token, int16_t& error) {
  parameters->recordInfo = 0;
  const Vireo::WriteDescriptorProcTable* procs = parameters->writeProcs;
  const auto putInteger = Vireo::TableProc<Vireo::PutIntegerProc>(procs, 3);
  const auto putFloat = Vireo::TableProc<Vireo::PutFloatProc>(procs, 4);

  const double angle = result.angle;
  error = putFloat != nullptr ? putFloat(token, FourCharCode("angl"), &angle) : int16_t{0};
  const CornerQuad& c = result.corners;
  const struct {
    uint32_t key;
    int16_t value;
  } integers[] = {
      {FourCharCode("conf"), result.confidence}, {FourCharCode("pt1v"), c.corner[0].v},
      {FourCharCode("pt1h"), c.corner[0].h},     {FourCharCode("pt2v"), c.corner[1].v},
      {FourCharCode("pt2h"), c.corner[1].h},     {FourCharCode("pt3v"), c.corner[2].v},
      {FourCharCode("pt3h"), c.corner[2].h},     {FourCharCode("pt4v"), c.corner[3].v},
      {FourCharCode("pt4h"), c.corner[3].h},
  };
  for (const auto& item : integers) {
    error = putInteger != nullptr ? putInteger(token, item.key, int32_t{item.value}) : int16_t{0};
  }
  return error == 0;
}

bool PutResultKeys(Vireo::DescriptorParameters* parameters, void* token, int16_t& error) {
  return PutResultKeysFrom(ModuleAnalysisResult(), parameters, token, error);
}

}  // namespace Project
