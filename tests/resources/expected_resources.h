// The bytes the module's resources must hold, built here field by field from
// the published tables, independently of how the build generates them.
#pragma once

#include <string>
#include <vector>

#include "byte_reader.h"

namespace ResourceTest {

struct ExpectedProperty {
  std::string key;
  Bytes data;  // padded as stored
};

// The eleven properties of the plug-in property list, in order.
std::vector<ExpectedProperty> ExpectedProperties();

// The whole property list: header, then every property with its vendor '9ZKT'.
Bytes ExpectedPropertyList();

// The scripting terminology of the 'fRNG' event.
Bytes ExpectedTerminology();

}  // namespace ResourceTest
