// The shorter way from the bytes to the dictionary form says what the message would.
#include <gtest/gtest.h>

#include "Damage.h"
#include "ForAllClasses.h"
#include "Wire.h"
#include "base/Rendering.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"

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
