#include "tesk/bus/EventPacket.h"

#include <gtest/gtest.h>

#include <limits>
#include <memory>

#include "messages/event_packet.h"
#include "tesk/Constants.h"

namespace tesk::bus {
namespace {

using qel::Bytes;
using qel::Dictionary;

const Dictionary kEvent{{"kKeyMetricID", 3952132},
                        {"kKeyProfileID", 0},
                        {"kKeyPayload", Bytes{0x08, 0x01}},
                        {"negative", std::numeric_limits<std::int64_t>::min()},
                        {"name", "text"},
                        {"flag", true}};

TEST(EventPacket, carriesAnEventWholeAndInOrder) {
  const auto packet = encodeEvent(kEventMetric, Message(kEvent));
  ASSERT_TRUE(packet);
  const auto event = decodeEvent(*packet);
  ASSERT_TRUE(event);
  EXPECT_EQ(event->name, kEventMetric);
  EXPECT_EQ(event->message.entries(), kEvent);
  EXPECT_EQ(event->message.entries().at(2).key.view(), "kKeyPayload");
}

TEST(EventPacket, carriesTriggersToo) {
  const auto packet = encodeEvent(kEventTrigger, Message(Dictionary{{"kKeyTriggerID", 5}}));
  EXPECT_EQ(decodeEvent(*packet)->name, kEventTrigger);
}

TEST(EventPacket, leavesOutValuesThatDoNotTravel) {
  const Message odd(Dictionary{{"a", 1},
                               {"float", 0.5F},
                               {"null", qel::Value()},
                               {"list", qel::List{1}},
                               {"large", std::numeric_limits<std::uint64_t>::max()}});
  EXPECT_EQ(decodeEvent(*encodeEvent(kEventMetric, odd))->message.entries(),
            (Dictionary{{"a", 1}}));
}

TEST(EventPacket, isIdentifiedByAnInteger) {
  const auto identified = [](std::string_view stream, const Dictionary& entries) {
    return isIdentified(StreamEvent{stream, Message(entries)});
  };
  EXPECT_TRUE(identified(kEventMetric, kEvent));
  EXPECT_FALSE(identified(kEventMetric, {}));
  EXPECT_FALSE(identified(kEventMetric, {{"kKeyMetricID", "3952132"}}));
  EXPECT_FALSE(identified(kEventMetric, {{"kKeyMetricID", Bytes{1}}}));
  EXPECT_TRUE(identified(kEventTrigger, {}));
}

TEST(EventPacket, isNeverLargerThanItsLimit) {
  const auto sized = [](std::size_t size) {
    return encodeEvent(kEventMetric, Message(Dictionary{{"kKeyPayload", Bytes(size)}}));
  };
  EXPECT_TRUE(sized(kLargestPacket - 100));
  EXPECT_FALSE(sized(kLargestPacket));
  EXPECT_FALSE(decodeEvent(Bytes(kLargestPacket + 1)));
}

TEST(EventPacket, knowsNoOtherStreams) {
  EXPECT_FALSE(encodeEvent("kEventOther", Message()));
  qel::EventPacket packet;
  packet.setStream(3);
  EXPECT_FALSE(decodeEvent(packet.data()));
  EXPECT_FALSE(decodeEvent({}));
}

TEST(EventPacket, refusesAnEntryWithoutKeyOrValue) {
  for (const bool withKey : {true, false}) {
    auto entry = std::make_shared<qel::EventEntry>();
    if (withKey) {
      entry->setKey("key");
    } else {
      entry->setInteger(1);
    }
    qel::EventPacket packet;
    packet.setStream(1);
    packet.addEntries(entry);
    EXPECT_FALSE(decodeEvent(packet.data()));
  }
}

TEST(EventPacket, isRefusedWhenCutOffInAnEntry) {
  const Bytes whole = *encodeEvent(kEventMetric, Message(kEvent));
  std::size_t readable = 0;
  for (std::size_t size = 0; size < whole.size(); ++size) {
    const auto exact = std::make_unique<std::uint8_t[]>(size);
    std::copy_n(whole.begin(), size, exact.get());
    if (decodeEvent({exact.get(), size})) ++readable;
  }
  // Only a packet cut between two entries is still one.
  EXPECT_EQ(readable, kEvent.size());
}

}  // namespace
}  // namespace tesk::bus
