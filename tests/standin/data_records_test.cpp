// The document's data records: 1-based lists per type that keep copies.
#include <gtest/gtest.h>

#include "host_fixture.h"
#include "standin/data_store.h"
#include "standin/fourcc.h"

namespace {

using DataRecords = ScriptedHostTest;
using Standin::FourCC;

constexpr uint32_t kType = FourCC("fRNG");

TEST_F(DataRecords, AddStoresACopyTheCallerStillOwns) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.NewHandle(3);
    uint8_t* bytes = side.Lock(handle);
    bytes[0] = 1;
    bytes[1] = 2;
    bytes[2] = 3;
    EXPECT_EQ(side.AddRecord(kType, handle), 0);
    bytes[0] = 99;  // after the add: the stored copy must not see it
    side.Unlock(handle);
    side.DisposeHandle(handle);
  });
  host_.CheckRunEnd();
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  EXPECT_EQ(host_.Records(kType), (std::vector<std::vector<uint8_t>>{{1, 2, 3}}));
}

TEST_F(DataRecords, ListsAreOneBasedPerTypeAndDeletionShifts) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    side.Publish(kType, {1});
    side.Publish(kType, {2});
    side.Publish(kType, {3});
    side.Publish(FourCC("othr"), {7});
    EXPECT_EQ(side.CountRecords(kType), 3);
    EXPECT_EQ(side.CountRecords(FourCC("none")), 0);
    EXPECT_EQ(side.GetRecord(kType, 0), nullptr);
    EXPECT_EQ(side.GetRecord(kType, 4), nullptr);
    EXPECT_EQ(side.Lock(side.GetRecord(kType, 1))[0], 1);
    side.DeleteRecord(kType, 2);
    EXPECT_EQ(side.CountRecords(kType), 2);
    EXPECT_EQ(side.Lock(side.GetRecord(kType, 2))[0], 3);
  });
  EXPECT_EQ(host_.Records(kType), (std::vector<std::vector<uint8_t>>{{1}, {3}}));
  EXPECT_EQ(host_.Records(FourCC("othr")).size(), 1u);
}

TEST_F(DataRecords, DeletingWhatIsNotThereIsReported) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) { side.DeleteRecord(kType, 1); });
  EXPECT_NE(Problems().find("does not exist"), std::string::npos) << Problems();
}

TEST_F(DataRecords, DeletedRecordsHandleIsNoLongerLive) {
  host_.Doc().Store().Add(kType, {5});
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.GetRecord(kType, 1);
    side.DeleteRecord(kType, 1);
    EXPECT_EQ(side.Lock(handle), nullptr);
  });
  EXPECT_NE(Problems().find("lock handle of a disposed handle"), std::string::npos) << Problems();
}

TEST(DataStore, SerialsStayUniqueAcrossStores) {
  Standin::DataStore first, second;
  uint64_t a = first.Add(kType, {1}).serial;
  uint64_t b = second.Add(kType, {1}).serial;
  EXPECT_NE(a, b);
  EXPECT_FALSE(first.Delete(kType, 2));
  EXPECT_TRUE(first.Delete(kType, 1));
  EXPECT_EQ(first.Count(kType), 0);
}

}  // namespace
