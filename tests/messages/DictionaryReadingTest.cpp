// The shorter way from the bytes to the dictionary form says what the message would.
#include <gtest/gtest.h>

#include <algorithm>

#include "Damage.h"
#include "ForAllClasses.h"
#include "OtherSenders.h"
#include "Schemas.h"
#include "Wire.h"
#include "base/Rendering.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

template <class Message>
std::optional<std::string> byMessage(ByteView bytes) {
  const auto message = Message::initWithData(bytes);
  if (!message) return std::nullopt;
  return jsonText(message->dictionaryRepresentation());
}

template <class Message>
std::optional<std::string> straight(ByteView bytes) {
  const auto dictionary = Message::dictionaryWithData(bytes);
  if (!dictionary) return std::nullopt;
  return jsonText(*dictionary);
}

TEST(DictionaryReading, saysOfEveryClassWhatTheMessageSays) {
  testing::forAllClasses([]<class Message>(std::uint64_t number) {
    const auto message = testing::randomMessage<Message>(number);
    ASSERT_NE(message, nullptr);
    const Bytes inOrder = message->data();
    EXPECT_EQ(straight<Message>(inOrder), byMessage<Message>(inOrder));
    const Bytes asItCame = testing::RandomMessages(number).encoded(Message::kClassName);
    EXPECT_EQ(straight<Message>(asItCame), byMessage<Message>(asItCame));
  });
}

TEST(DictionaryReading, saysTheSameOfDamagedBytes) {
  testing::forAllClasses([]<class Message>(std::uint64_t number) {
    testing::RandomMessages random(number);
    const Bytes whole = random.encoded(Message::kClassName);
    for (int i = 0; i < 10; ++i) {
      const Bytes bytes = testing::damaged(random, whole);
      EXPECT_EQ(straight<Message>(bytes), byMessage<Message>(bytes)) << hexText(bytes);
    }
  });
}

// Calls law.operator()<Message>(random, schema, bytes) for random messages of every class.
template <class Law>
void forRandomBytes(Law&& law) {
  testing::forAllClasses([&]<class Message>(std::uint64_t number) {
    testing::RandomMessages random(number);
    const Bytes whole = random.encoded(Message::kClassName);
    law.template operator()<Message>(random, testing::schemaOf(Message::kClassName), whole);
  });
}

template <class Message>
void expectBothSayTheSame(const Bytes& bytes) {
  const testing::ExactBuffer exact(bytes);
  EXPECT_EQ(straight<Message>(exact.view()), byMessage<Message>(exact.view())) << hexText(bytes);
}

TEST(DictionaryReading, saysTheSameOfFieldsInAnyOrder) {
  forRandomBytes([]<class Message>(auto& random, const auto& schema, const Bytes& whole) {
    for (int i = 0; i < 5; ++i) {
      const Bytes bytes = testing::shuffled(random, schema, whole);
      EXPECT_NE(straight<Message>(bytes), std::nullopt);
      expectBothSayTheSame<Message>(bytes);
      expectBothSayTheSame<Message>(testing::damaged(random, bytes));
    }
  });
}

TEST(DictionaryReading, saysTheSameOfFieldsThatComeTwice) {
  forRandomBytes([]<class Message>(auto& random, const auto& schema, const Bytes& whole) {
    const Bytes bytes = testing::doubled(random, schema, whole);
    EXPECT_NE(straight<Message>(bytes), std::nullopt);
    expectBothSayTheSame<Message>(bytes);
    expectBothSayTheSame<Message>(testing::damaged(random, bytes));
  });
}

TEST(DictionaryReading, saysTheSameAtEveryCut) {
  forRandomBytes([]<class Message>(auto& random, const auto& schema, const Bytes& whole) {
    const Bytes mixed = testing::shuffled(random, schema, whole);
    for (std::size_t length = 0; length < whole.size(); ++length) {
      expectBothSayTheSame<Message>({whole.begin(), whole.begin() + static_cast<long>(length)});
      expectBothSayTheSame<Message>({mixed.begin(), mixed.begin() + static_cast<long>(length)});
    }
  });
}

TEST(DictionaryReading, leavesOutWhatOnlyALaterSchemaKnows) {
  forRandomBytes([]<class Message>(auto& random, const auto& schema, const Bytes& whole) {
    const Bytes later = testing::fromTheFuture(random, schema, whole);
    EXPECT_EQ(straight<Message>(later), straight<Message>(whole)) << hexText(later);
    const Bytes mixed = testing::shuffled(random, schema, later);
    EXPECT_NE(straight<Message>(mixed), std::nullopt);
    expectBothSayTheSame<Message>(mixed);
  });
}

TEST(DictionaryReading, ofAnyBytesTheCheckSaysWhetherThereIsAMessage) {
  testing::forAllClasses([]<class Message>(std::uint64_t number) {
    testing::RandomMessages random(number);
    const Bytes whole = random.encoded(Message::kClassName);
    EXPECT_TRUE(Message::isReadable(whole));
    for (int i = 0; i < 20; ++i) {
      const Bytes bytes = testing::damaged(random, whole);
      const testing::ExactBuffer exact(bytes);
      EXPECT_EQ(Message::isReadable(exact.view()), Message::initWithData(bytes) != nullptr)
          << hexText(bytes);
    }
  });
}

TEST(DictionaryReading, logsAnUnknownTagOnce) {
  testing::CapturedSystemLog systemLog;
  // Twice what comes once, behind a metric's number in a nested message.
  const Bytes bytes = testing::joined(
      testing::delimitedField(
          3, testing::joined(testing::varintField(19972, 7), testing::varintField(2, 1))),
      testing::varintField(1, 1), testing::varintField(1, 2));
  EXPECT_EQ(straight<KCellularLteServingCellMeasurement>(bytes),
            R"({"timestamp": 2, "rx_info": [{"rsrp_range": 1}]})");
  EXPECT_EQ(std::ranges::count(systemLog.lines(), "Unknown tag: 4e04:7"), 1);
  systemLog.clear();
  EXPECT_TRUE(KCellularLteServingCellMeasurement::isReadable(bytes));
  EXPECT_EQ(std::ranges::count(systemLog.lines(), "Unknown tag: 4e04:7"), 1);
}

TEST(DictionaryReading, knowsThePackedListThatIsNotThere) {
  EXPECT_EQ(straight<KCellularLteSelReselCellInfo>({}),
            byMessage<KCellularLteSelReselCellInfo>({}));
  EXPECT_EQ(straight<KCellularLteSelReselCellInfo>({}), R"({"multi_band_info": []})");
}

TEST(DictionaryReading, leavesWhatComesTwiceToTheMessage) {
  const Bytes twice = {0x08, 0x01, 0x08, 0x02};
  EXPECT_EQ(straight<KCellularLteRrcState>(twice), R"({"timestamp": 2})");
  EXPECT_EQ(straight<KCellularLteRrcState>(Bytes{0x08}), std::nullopt);
}

}  // namespace
}  // namespace qel
