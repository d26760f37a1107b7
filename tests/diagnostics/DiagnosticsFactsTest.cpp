#include "sources/diagnostics/DiagnosticsFacts.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qel::diagnostics {
namespace {

using namespace std::chrono_literals;
using ::testing::Contains;
using ::testing::IsEmpty;
using ::testing::Pair;

TEST(DiagnosticsFacts, SayNothingOfAPortThatIsNotThere) {
  EXPECT_THAT(factsOf({}, {}).rows, IsEmpty());
}

TEST(DiagnosticsFacts, CountPacketsByKindAndOutcome) {
  PacketCounts counts;
  counts.count({false, 0xB193, 36U}, Outcome::understood);
  counts.count({false, 0xB193, 36U}, Outcome::understood);
  counts.count({false, 0xB193, 59U}, Outcome::unknownVersion);
  counts.count({false, 0x412F, {}}, Outcome::damaged);
  counts.count({true, 1606, {}}, Outcome::understood);
  PortFacts port;
  port.port = "/dev/ttyUSB0";
  port.frames.badFrames = 3;
  const auto rows = factsOf(port, counts).rows;
  EXPECT_THAT(rows, Contains(Pair("port", "/dev/ttyUSB0")));
  EXPECT_THAT(rows, Contains(Pair("bad frames", "3")));
  EXPECT_THAT(rows, Contains(Pair("log B193 version 36", "2 understood")));
  EXPECT_THAT(rows, Contains(Pair("log B193 version 59", "1 of an unknown version")));
  EXPECT_THAT(rows, Contains(Pair("log 412F", "1 damaged")));
  EXPECT_THAT(rows, Contains(Pair("event 1606", "1 understood")));
}

TEST(ByteRate, IsThatOfTheLastSeconds) {
  ByteRate rate;
  ByteRate::Clock::time_point now{1h};
  EXPECT_EQ(rate.perSecond(now), 0U);
  std::uint64_t bytes = 0;
  for (int s = 0; s < 60; ++s) {
    bytes += s < 30 ? 1000 : 200;
    rate.note(bytes, now);
    now += 1s;
  }
  EXPECT_NEAR(static_cast<double>(rate.perSecond(now)), 200, 40);
  EXPECT_EQ(rate.perSecond(now + 20s), 0U);
}

TEST(ByteRate, BeginsAnewWithAnotherPort) {
  ByteRate rate;
  const ByteRate::Clock::time_point now{1h};
  rate.note(1'000'000, now);
  rate.note(0, now + 1s);
  rate.note(2000, now + 3s);
  EXPECT_EQ(rate.perSecond(now + 3s), 1000U);
}

}  // namespace
}  // namespace qel::diagnostics
