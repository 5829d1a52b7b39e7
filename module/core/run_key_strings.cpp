// Key-string resolution through the run's cache and the process object.
#include "core/run_key_strings.h"

#include <string>

#include "core/localize.h"
#include "core/process.h"
#include "core/service.h"
#include "core/string_table.h"

namespace Vireo {
namespace {

KeyStringTranslator ProcessTranslator() {
  CProcess* process = CProcess::Current();
  if (process == nullptr) return nullptr;
  return [process](std::string& bytes) {
    CText text = CText::FromUtf8(bytes);
    if (!process->TranslateKeyString(text)) return false;
    bytes = text.Utf8();
    return true;
  };
}

}  // namespace

void LocalizeString(CText& text) {
  std::string bytes = text.Utf8();
  LocalizeString(bytes, {CServiceT<CStringTable>::Get(), ProcessTranslator()});
  text = CText::FromUtf8(bytes);
}

void ReplacePlaceholder(CText& text, int index, const CText& value) {
  std::string bytes = text.Utf8();
  ReplacePlaceholder(bytes, index, value.Utf8(),
                     {CServiceT<CStringTable>::Get(), ProcessTranslator()});
  text = CText::FromUtf8(bytes);
}

}  // namespace Vireo
