// Names and versions of the host suites, in release order.
#include "host/suite_catalog.h"

#include <array>
#include <cstddef>

namespace Vireo {
namespace {

constexpr std::array<SuiteName, static_cast<std::size_t>(SuiteId::kCount)> kSuites = {{
    {"Rastrix ChannelPorts Suite for Plug-ins", 3, false},
    {"OS Direct SwiftView Suite", 3, false},
    {"Rastrix Utilities Suite for Plug-ins", 1, false},
    {"Rastrix Palette Suite", 1, false},
    {"HS KeyString Suite", 1, false},
    {"HS KeyString Dictionary Suite", 1, false},
    {"Rastrix UIHooks Suite for Plug-ins", 1, false},
    {"Rastrix UIHooks Suite for Plug-ins", 2, false},
    {"Rastrix UIHooks Suite for Plug-ins", 3, false},
    {"Rastrix UIHooks Suite for Plug-ins", 4, false},
    {"Rastrix Mouse Tracking Suite for Plug-ins", 3, false},
    {"Rastrix Mouse Tracking Suite for Plug-ins", 4, false},
    {"Rastrix Help Suite for Plug-ins", 1, false},
    {"Rastrix Help Suite for Plug-ins", 2, false},
    {"Rastrix Buffer Suite for Plug-ins", 1, false},
    {"Halden Beacon Suite", 1, false},
    {"3eb7c480-8797-11d1-8da7-00c04fd5f7ee", 3, true},
    {"df135117-c769-11d0-8079-00c04fd7ec47", 3, true},
    {"df135115-c769-11d0-8079-00c04fd7ec47", 5, true},
    {"df135116-c769-11d0-8079-00c04fd7ec47", 3, true},
}};

}  // namespace

const SuiteName& SuiteNameOf(SuiteId id) {
  return kSuites.at(static_cast<std::size_t>(id));
}

}  // namespace Vireo
