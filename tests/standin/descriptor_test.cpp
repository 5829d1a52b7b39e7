// The descriptor write procedures and the descriptor they hand back.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>

#include "host_fixture.h"
#include "standin/descriptor.h"
#include "standin/fourcc.h"

namespace {

using Standin::Descriptor;
using Standin::FourCC;
using Standin::Proc;

uint64_t Bits(double value) {
  uint64_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  return bits;
}

TEST(DescriptorBytes, RoundTripKeepsOrderKindsAndEveryBit) {
  Descriptor descriptor;
  descriptor.PutFloat(FourCC("angl"), -0.0);
  descriptor.PutInteger(FourCC("conf"), -129);
  descriptor.PutFloat(FourCC("nan "), std::nan("7"));
  descriptor.PutInteger(FourCC("pt1v"), 2147483647);
  std::string problem;
  auto back = Descriptor::Parse(descriptor.Serialize(), &problem);
  ASSERT_TRUE(back) << problem;
  EXPECT_EQ(back->Keys(), descriptor.Keys());
  EXPECT_EQ(Bits(*back->Float(FourCC("angl"))), Bits(-0.0));
  EXPECT_EQ(Bits(*back->Float(FourCC("nan "))), Bits(std::nan("7")));
  EXPECT_EQ(back->Integer(FourCC("conf")), -129);
  EXPECT_EQ(back->Integer(FourCC("pt1v")), 2147483647);
  EXPECT_FALSE(back->Integer(FourCC("angl")));  // a float is not an integer
}

TEST(DescriptorBytes, DamagedBytesAreRefused) {
  Descriptor descriptor;
  descriptor.PutInteger(FourCC("conf"), 1);
  std::vector<uint8_t> bytes = descriptor.Serialize();
  std::string problem;
  EXPECT_FALSE(Descriptor::Parse({bytes.begin(), bytes.end() - 1}, &problem));
  bytes[12] ^= 0xFF;  // the item's kind
  EXPECT_FALSE(Descriptor::Parse(bytes, &problem));
  EXPECT_FALSE(Descriptor::Parse({}, &problem));
}

using DescriptorWrite = ScriptedHostTest;

TEST_F(DescriptorWrite, HostCollectsTheDescriptorLeftInTheBlockAtFinish) {
  host_.BeginRun();
  During(5, [](Scripted::HostSide& side) { EXPECT_EQ(side.WriteDescriptor(12.5, 255), 0); });
  host_.CheckRunEnd();
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  ASSERT_TRUE(host_.LastDescriptor());
  EXPECT_EQ(host_.LastDescriptor()->Keys(),
            (std::vector<uint32_t>{FourCC("angl"), FourCC("conf")}));
  EXPECT_EQ(host_.LastDescriptor()->Float(FourCC("angl")), 12.5);
  EXPECT_EQ(host_.LastDescriptor()->Integer(FourCC("conf")), 255);
  EXPECT_EQ(Scripted::Read<void*>(host_.DescriptorBlock().Data(), 8), nullptr);
}

TEST_F(DescriptorWrite, ReplacedEarlierDescriptorIsDisposedBeforeTheClose) {
  host_.BeginRun();
  Descriptor old;
  old.PutInteger(FourCC("conf"), 1);
  void* seeded = host_.SeedDescriptorHandle(old);
  During(5, [](Scripted::HostSide& side) {
    void* token = side.OpenWrite();
    void** slot =
        static_cast<void**>(static_cast<void*>(static_cast<uint8_t*>(side.DescriptorBlock()) + 8));
    side.DisposeHandle(*slot);
    *slot = nullptr;
    EXPECT_EQ(side.CloseWrite(token, slot), 0);
  });
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  EXPECT_FALSE(host_.Handles().Find(seeded)->live);
  const auto& events = host_.Events();
  ASSERT_EQ(events.size(), 3u);
  EXPECT_EQ(events[1].proc, Proc::HandleDispose);
  EXPECT_EQ(events[1].handle, host_.Handles().Find(seeded)->id);
  EXPECT_EQ(events[2].proc, Proc::DescriptorClose);
}

TEST_F(DescriptorWrite, TokenMisuseIsReported) {
  host_.BeginRun();
  During(5, [](Scripted::HostSide& side) {
    void* token = side.OpenWrite();
    void* handle = nullptr;
    EXPECT_EQ(side.CloseWrite(token, &handle), 0);
    side.DisposeHandle(handle);
    EXPECT_NE(side.PutInteger(token, FourCC("conf"), 1), 0);
    EXPECT_NE(side.CloseWrite(token, &handle), 0);
    side.OpenWrite();  // never closed
  });
  host_.CheckRunEnd();
  const std::string problems = Problems();
  EXPECT_NE(problems.find("put integer on a descriptor token that is not open"), std::string::npos)
      << problems;
  EXPECT_NE(problems.find("close of a descriptor token that is not open"), std::string::npos)
      << problems;
  EXPECT_NE(problems.find("opened and never closed"), std::string::npos) << problems;
}

TEST_F(DescriptorWrite, FailingPutsStoreNothingAndAFailingCloseSpendsTheToken) {
  host_.Faults().FailAt(Proc::DescriptorPutFloat, 1, 1, -20);
  host_.Faults().FailAt(Proc::DescriptorClose, 1, 1, -34);
  host_.BeginRun();
  During(5, [](Scripted::HostSide& side) {
    void* token = side.OpenWrite();
    EXPECT_EQ(side.PutFloat(token, FourCC("angl"), 1.0), -20);
    void* handle = nullptr;
    EXPECT_EQ(side.CloseWrite(token, &handle), -34);
    EXPECT_EQ(handle, nullptr);
  });
  host_.CheckRunEnd();
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  EXPECT_FALSE(host_.LastDescriptor());
}

}  // namespace
