// Support for the end-to-end tests: each test gets a private copy of the built
// module (no module-wide state from another test), its alerts diverted to a
// file of its own, and documents made from synthetic pages.
#pragma once

#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "standin/host.h"
#include "synth/page_generator.h"

namespace E2E {

constexpr uint32_t kRecordType = 0x66524E47;  // 'fRNG'

// The module file under test: $FRINGE_MODULE, or the one this build made.
std::string ModulePath();

// A document holding the generated page's pixels.
Standin::Document PageDocument(const Synth::PageRecipe& recipe);
// An RGB page with a photo well inside it, turned by `angle`.
Synth::PageRecipe PhotoPage(int width, int height, double angle, uint32_t seed = 1);
// The same without a photo.
Synth::PageRecipe BlankPage(int width, int height, uint32_t seed = 1);

// The record values (9) of each 'fRNG' record the document holds.
std::vector<std::array<int16_t, 9>> RecordValues(const Standin::Host& host);
// The whole-document failure record of a document of rows x columns.
std::array<int16_t, 9> FailureRecord(int16_t rows, int16_t columns);

class ModuleTest : public ::testing::Test {
 protected:
  ModuleTest();
  ~ModuleTest() override;
  void TearDown() override;

  // A host for `document` over this test's module.
  std::unique_ptr<Standin::Host> MakeHost(Standin::Document document);
  // The lines the module appended to the alert log, consumed: the test's end
  // checks that nothing else arrived.
  std::vector<std::string> TakeAlerts();
  // Expects the host to have seen nothing wrong.
  static void ExpectClean(const Standin::Host& host);

  std::unique_ptr<Standin::Module> module_;

 private:
  std::string alertLog_;
};

}  // namespace E2E
