// A stand-in host around the scripted module: each test scripts what the
// "module" does inside a selector and looks at what the host saw.
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <memory>

#include "scripted_module.h"
#include "standin/host.h"

class ScriptedHostTest : public ::testing::Test {
 protected:
  explicit ScriptedHostTest(Standin::Document document = Standin::Document(64, 48, 3))
      : module_(Scripted::MakeModule()), host_(*module_, std::move(document)) {}
  ~ScriptedHostTest() override { Scripted::SetScript(nullptr); }

  // Runs `body` as the module's work for one selector of the current run and
  // answers the result word.
  int16_t During(int16_t selector, const std::function<void(Scripted::HostSide&)>& body) {
    Scripted::SetScript([&](int16_t, uint8_t* record, int16_t*) {
      Scripted::HostSide side(record);
      body(side);
    });
    return host_.Call(selector);
  }

  // Problems the host noted, one per line, for failure messages.
  std::string Problems() { return host_.Problems().Text(); }

  std::unique_ptr<Standin::Module> module_;
  Standin::Host host_;
};
