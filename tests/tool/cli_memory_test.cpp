// Peak memory for one large page: at most three times the decoded frame (the
// frame itself and the host's input and output buffers) plus 64 MiB.
#include "cli_fixture.h"

namespace FringeTest {
namespace {

#if defined(__SANITIZE_ADDRESS__)
constexpr bool kSanitized = true;
#else
constexpr bool kSanitized = false;
#endif

using MemoryTest = CliTest;

TEST_F(MemoryTest, OnePageStaysWithinThreeFramesAndSixtyFourMebibytes) {
  if (kSanitized) GTEST_SKIP() << "the sanitizers' own memory would be measured";
  // Large enough that one more copy of the frame would break the bound.
  const int width = 6000, height = 4000;
  const std::string page = WritePageFile("big.png", Layout::Rgb, 4.0, true, width, height);
  const RunOutcome r = Fringe({"all", "--json", page, "-o", tmp_ / "out"});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const long frameKb = static_cast<long>(width) * height * 3 / 1024;
  EXPECT_LE(r.peakKilobytes, 3 * frameKb + 64 * 1024)
      << "frame " << frameKb << " kB, peak " << r.peakKilobytes << " kB";
}

}  // namespace
}  // namespace FringeTest
