// The host suites the frame knows by name and version, listed in the order in
// which the plug-in object releases them when it is destroyed.
#pragma once

#include <cstdint>

namespace Vireo {

enum class SuiteId : int {
  kChannelPorts3,
  kSwiftView3,
  kUtilities1,
  kPalette1,
  kKeyString1,
  kKeyStringDictionary1,
  kUIHooks1,
  kUIHooks2,
  kUIHooks3,
  kUIHooks4,
  kMouseTracking3,
  kMouseTracking4,
  kHelp1,
  kHelp2,
  kBuffer1,
  kBeacon1,
  kTypeIdentifiers3,
  kToolkit17v3,
  kDescriptorBuilder5,
  kToolkit16v3,
  kCount
};

struct SuiteName {
  const char* name;
  int32_t version;
  // Fetched through the basic-suite accessor every time rather than the cache.
  bool identifierNamed;
};

const SuiteName& SuiteNameOf(SuiteId id);

}  // namespace Vireo
