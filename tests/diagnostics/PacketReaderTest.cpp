#include "sources/diagnostics/packets/PacketReader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "sources/diagnostics/packets/DeviceTime.h"
#include "support/diagnostics/PacketLog.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using test::eventPacket;
using test::kSomeTimeMs;
using test::logPacket;
using test::PacketLog;
using test::wrapped;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

struct Reading {
  PacketLog log;
  PacketReader reader{log};

  void take(ByteView packet) {
    // A buffer of its own: reading past the end is seen by the sanitizers.
    const Bytes exact(packet.begin(), packet.end());
    reader.take(exact);
  }
  bool nothing() const { return log.logs.empty() && log.events.empty() && log.answers.empty(); }
};

TEST(DeviceTime, CountsFrom1980InStepsOf125Hundredths) {
  EXPECT_EQ(deviceTimeMs(0), 315'964'800'000U);
  EXPECT_EQ(deviceTimeMs(std::uint64_t{800} << 16), 315'964'801'000U);
  EXPECT_EQ(deviceTimeMs(49151), 315'964'800'001U);
  for (std::uint64_t ms = kSomeTimeMs; ms < kSomeTimeMs + 20; ++ms) {
    EXPECT_EQ(deviceTimeMs(test::stampOf(ms)), ms);
  }
}

TEST(DeviceTime, HoldsEveryStamp) {
  EXPECT_EQ(deviceTimeMs(~std::uint64_t{0}), 352'159'685'688'320U);
}

TEST(PacketReader, TellsALogPacket) {
  Reading reading;
  reading.take(logPacket(0xB193, Bytes{1, 2, 3}));
  ASSERT_THAT(reading.log.logs, SizeIs(1));
  const PacketLog::Log& log = reading.log.logs[0];
  EXPECT_EQ(log.code, 0xB193);
  EXPECT_EQ(log.timeMs, kSomeTimeMs);
  EXPECT_EQ(log.radio, 0U);
  EXPECT_EQ(log.body, (Bytes{1, 2, 3}));
  EXPECT_EQ(reading.reader.counts().logs, 1U);
}

TEST(PacketReader, LooksThroughAWrapperAroundAnything) {
  Reading reading;
  reading.take(wrapped(2, logPacket(0xB0C0, {})));
  reading.take(wrapped(1, eventPacket({{1606, {4}}})));
  reading.take(wrapped(1, Bytes{0x7C, 1}));
  ASSERT_THAT(reading.log.logs, SizeIs(1));
  EXPECT_EQ(reading.log.logs[0].radio, 2U);
  ASSERT_THAT(reading.log.events, SizeIs(1));
  EXPECT_EQ(reading.log.events[0].radio, 1U);
  EXPECT_THAT(reading.log.answers, ElementsAre(Bytes{0x7C, 1}));
}

TEST(PacketReader, LooksThroughOneWrapperOnly) {
  Reading reading;
  reading.take(wrapped(1, wrapped(1, logPacket(0xB0C0, {}))));
  EXPECT_THAT(reading.log.logs, IsEmpty());
  EXPECT_EQ(reading.reader.counts().others[0x98], 1U);
}

TEST(PacketReader, TakesNoLogPacketWhoseLengthsDisagree) {
  const Bytes good = logPacket(0xB193, Bytes(20));
  for (const unsigned offset : {2U, 3U, 4U, 5U}) {
    Bytes bad = good;
    ++bad[offset];
    Reading reading;
    reading.take(bad);
    EXPECT_TRUE(reading.nothing()) << offset;
    EXPECT_EQ(reading.reader.counts().damaged, 1U);
  }
}

TEST(PacketReader, TakesNothingOfAPacketThatIsCutAnywhere) {
  const std::vector<Bytes> packets{logPacket(0xB193, Bytes(20)), wrapped(1, logPacket(0xB193, {})),
                                   eventPacket({{1606, {4}}, {1994, {1, 2, 3}}})};
  for (const Bytes& packet : packets) {
    for (std::size_t length = 0; length < packet.size(); ++length) {
      Reading reading;
      reading.take(ByteView(packet).first(length));
      EXPECT_THAT(reading.log.logs, IsEmpty()) << length;
      EXPECT_THAT(reading.log.events, IsEmpty()) << length;
    }
  }
}

TEST(PacketReader, SplitsEventsWithEveryFormOfPayload) {
  Reading reading;
  reading.take(
      eventPacket({{100, {}}, {101, {1}}, {102, {1, 2}}, {4095, {1, 2, 3}}, {104, Bytes(255)}}));
  ASSERT_THAT(reading.log.events, SizeIs(5));
  EXPECT_EQ(reading.log.events[0].payload, Bytes{});
  EXPECT_EQ(reading.log.events[1].payload, (Bytes{1}));
  EXPECT_EQ(reading.log.events[2].payload, (Bytes{1, 2}));
  EXPECT_EQ(reading.log.events[3].payload, (Bytes{1, 2, 3}));
  EXPECT_EQ(reading.log.events[3].id, 4095);
  EXPECT_EQ(reading.log.events[4].payload, Bytes(255));
  EXPECT_EQ(reading.log.events[4].timeMs, kSomeTimeMs);
  EXPECT_EQ(reading.reader.counts().events, 5U);
}

TEST(PacketReader, CompletesShortTimesFromTheEventBefore) {
  Reading reading;
  reading.take(eventPacket({{1, {}}}));
  for (const unsigned later : {0U, 5U, 200U, 400U, 700U, 715U}) {
    reading.take(eventPacket({{2, {}, kSomeTimeMs + later, true}}));
    EXPECT_NEAR(static_cast<double>(reading.log.events.back().timeMs),
                static_cast<double>(kSomeTimeMs + later), 1)
        << later;
  }
}

TEST(PacketReader, TakesNoEventWhoseTimeNobodyKnows) {
  Reading reading;
  reading.take(eventPacket({{1, {}, kSomeTimeMs, true}}));
  EXPECT_TRUE(reading.nothing());
  EXPECT_EQ(reading.reader.counts().damaged, 1U);
}

TEST(PacketReader, TakesNoneOfTheEventsOfADamagedPacket) {
  Bytes packet = eventPacket({{1, {}}, {2, {7}}});
  packet.pop_back();
  packet[1] = static_cast<std::uint8_t>(packet[1] - 1);  // the length fits, the last event does not
  Reading reading;
  reading.take(packet);
  EXPECT_TRUE(reading.nothing());
  EXPECT_EQ(reading.reader.counts().damaged, 1U);
}

TEST(PacketReader, HandsOverAnswersAndCountsThemByCommand) {
  Reading reading;
  reading.take(Bytes{0x60, 0, 0});
  reading.take(Bytes{0x79, 1, 2});
  reading.take(Bytes{0x79, 1, 2});
  EXPECT_THAT(reading.log.answers, SizeIs(3));
  EXPECT_EQ(reading.reader.counts().others[0x60], 1U);
  EXPECT_EQ(reading.reader.counts().others[0x79], 2U);
  EXPECT_EQ(reading.reader.counts().damaged, 0U);
}

}  // namespace
}  // namespace qel::diagnostics
