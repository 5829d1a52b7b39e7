// The scripted entry point.
#include "scripted_module.h"

namespace Scripted {

namespace {

Script& CurrentScript() {
  static Script script;
  return script;
}

void Entry(int16_t selector, void* record, intptr_t* /*data*/, int16_t* result) {
  *result = 0;
  if (CurrentScript()) CurrentScript()(selector, static_cast<uint8_t*>(record), result);
}

}  // namespace

void SetScript(Script script) {
  CurrentScript() = std::move(script);
}

std::unique_ptr<Standin::Module> MakeModule() {
  return Standin::Module::Wrap(&Entry, "scripted test module");
}

}  // namespace Scripted
