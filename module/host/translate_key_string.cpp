// Translation of key strings through the host. The host's translation suites
// are not asked yet: every key string shows its default text.
#include "host/rastrix_plugin.h"

namespace Vireo {

bool CRastrixPlugin::TranslateKeyString(CText& /*text*/) {
  return false;
}

}  // namespace Vireo
