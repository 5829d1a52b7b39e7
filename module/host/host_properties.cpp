// Host properties: reading and writing through the property procedures, and
// the properties the frame reads at creation and at start.
#include "host/four_char_code.h"
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {
namespace {

bool PropertyTableUsable(const PropertyProcTable* table) {
  return TableCount(table) >= 2 && TableComplete(table, 2);
}

}  // namespace

bool CRastrixPlugin::HasPropertyProcs() const {
  return HasHandleProcs() && PropertyTableUsable(PropertyProcs());
}

bool CRastrixPlugin::GetHostPropertyFrom(const PropertyProcTable* table, uint32_t signature,
                                         uint32_t key, int32_t index, intptr_t& value) {
  value = 0;
  if (!HasHandleProcs() || !PropertyTableUsable(table)) return false;
  intptr_t simple = 0;
  HostHandle complex = nullptr;
  const int16_t error =
      TableProc<GetPropertyProc>(table, 1)(signature, key, index, &simple, &complex);
  // A handle handed over is ours to dispose, whatever the result says.
  DisposeHostHandle(complex);
  if (error != 0) return false;
  value = simple;
  return true;
}

bool CRastrixPlugin::GetHostProperty(uint32_t signature, uint32_t key, int32_t index,
                                     intptr_t& value) {
  return GetHostPropertyFrom(PropertyProcs(), signature, key, index, value);
}

bool CRastrixPlugin::GetHostPropertyHandle(uint32_t signature, uint32_t key, int32_t index,
                                           HostHandle& handle) {
  handle = nullptr;
  if (!HasPropertyProcs()) return false;
  intptr_t simple = 0;
  HostHandle complex = nullptr;
  const int16_t error =
      TableProc<GetPropertyProc>(PropertyProcs(), 1)(signature, key, index, &simple, &complex);
  if (error != 0) {
    DisposeHostHandle(complex);
    return false;
  }
  handle = complex;
  return true;
}

bool CRastrixPlugin::SetHostProperty(uint32_t signature, uint32_t key, int32_t index,
                                     intptr_t value) {
  if (!HasPropertyProcs()) return false;
  return TableProc<SetPropertyProc>(PropertyProcs(), 2)(signature, key, index, value, nullptr) == 0;
}

bool CRastrixPlugin::SetHostPropertyHandle(uint32_t signature, uint32_t key, int32_t index,
                                           HostHandle handle) {
  if (!HasPropertyProcs()) return false;
  return TableProc<SetPropertyProc>(PropertyProcs(), 2)(signature, key, index, 0, handle) == 0;
}

void CRastrixPlugin::ReadHighDpiProperty(const PropertyProcTable* /*propertyProcs*/) {
  // Only the windowing toolkit scales its views; a filter without views has
  // nothing to read here.
}

void CRastrixPlugin::ReadHostInterfaceProperties(const PropertyProcTable* propertyProcs) {
  intptr_t value = 0;
  interfaceBrightness_ = 1;
  if (GetHostPropertyFrom(propertyProcs, kHostPropertySignature, FourCharCode("UIBR"), 0, value)) {
    interfaceBrightness_ = (value == 0 || value == 2 || value == 3) ? static_cast<int>(value) : 1;
  }
  lightInterface_ =
      GetHostPropertyFrom(propertyProcs, kHostPropertySignature, FourCharCode("LGTB"), 0, value) &&
      value == 1;
}

void CRastrixPlugin::ReadHostStartFlag() {
  intptr_t value = 0;
  if (GetHostProperty(kHostPropertySignature, FourCharCode("zScW"), 0, value)) {
    hostStartFlag_ = value != 0;
  }
}

}  // namespace Vireo
