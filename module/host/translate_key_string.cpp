// Translation of key strings through the host's translation suites, fetched
// once per plug-in object.
#include <string>

#include "host/key_string_translation.h"
#include "host/rastrix_plugin.h"

namespace Vireo {

bool CRastrixPlugin::TranslateKeyString(CText& text) {
  if (!TranslationSuitesFetched()) {
    // Asked for once: a host without them is not asked again by this object.
    Suite(SuiteId::kKeyString1);
    Suite(SuiteId::kKeyStringDictionary1);
    Suite(SuiteId::kSwiftView3);
    Suite(SuiteId::kUtilities1);
    SetTranslationSuitesFetched();
  }
  const TranslationSuites suites{
      CachedSuite(SuiteId::kKeyString1), CachedSuite(SuiteId::kKeyStringDictionary1),
      CachedSuite(SuiteId::kUtilities1), CachedSuite(SuiteId::kSwiftView3)};
  std::string bytes = text.Utf8();
  if (!TranslateThroughSuites(suites, PluginRef(), bytes)) return false;
  text = CText::FromUtf8(bytes);
  return true;
}

}  // namespace Vireo
