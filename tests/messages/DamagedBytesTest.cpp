// Cut-off, damaged and odd bytes of all classes, compared with the model of the rules. Every input
// ends where its memory ends, so a sanitizer sees a byte read past it.
#include <gtest/gtest.h>

#include "Damage.h"
#include "MessageClasses.h"
#include "ModelDecoder.h"
#include "RandomMessage.h"
#include "Schemas.h"
#include "Wire.h"
#include "base/Rendering.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using testing::MessageClass;
using testing::RandomMessages;

struct Tally {
  std::size_t decoded = 0;
  std::size_t refused = 0;
};

// One line of what came of the bytes, with what was logged.
std::string outcome(const std::optional<Dictionary>& dictionary,
                    const std::vector<std::string>& log) {
  std::string text = dictionary ? jsonText(*dictionary) : "nothing";
  for (const std::string& line : log) text += '\n' + line;
  return text;
}

void compareWithModel(const MessageClass& messageClass, const Bytes& bytes, Tally& tally) {
  const testing::CapturedSystemLog log;
  const testing::ExactBuffer input(bytes);
  const auto message = messageClass.decode(input.view());
  std::optional<Dictionary> dictionary;
  if (message) dictionary = message->dictionaryRepresentation();
  const auto expected = testing::modelDecode(testing::schemaOf(messageClass.name), bytes);
  EXPECT_EQ(outcome(dictionary, log.lines()), outcome(expected.dictionary, expected.log))
      << messageClass.name << ' ' << hexText(bytes);
  ++(message ? tally.decoded : tally.refused);
}

TEST(DamagedBytes, agreeWithTheModelAtEveryCut) {
  Tally tally;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= 10; ++number) {
      SCOPED_TRACE(number);
      const Bytes whole = RandomMessages(number).encoded(messageClass.name);
      for (std::size_t length = 0; length <= whole.size(); ++length) {
        const auto cut = whole.begin() + static_cast<std::ptrdiff_t>(length);
        compareWithModel(messageClass, Bytes(whole.begin(), cut), tally);
      }
      ASSERT_FALSE(HasFailure());
    }
  }
  EXPECT_GT(tally.decoded, 1000U);
  EXPECT_GT(tally.refused, 1000U);
}

TEST(DamagedBytes, agreeWithTheModelHoweverTheyAreDamaged) {
  Tally tally;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= 400; ++number) {
      SCOPED_TRACE(number);
      RandomMessages random(number);
      const Bytes bytes = damaged(random, random.encoded(messageClass.name));
      compareWithModel(messageClass, bytes, tally);
      ASSERT_FALSE(HasFailure());
    }
  }
  EXPECT_GT(tally.decoded, 1000U);
  EXPECT_GT(tally.refused, 1000U);
}

TEST(DamagedBytes, agreeWithTheModelWhenTheyAreNoMessageAtAll) {
  Tally tally;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= 200; ++number) {
      SCOPED_TRACE(number);
      compareWithModel(messageClass, RandomMessages(number).bytes(40), tally);
      ASSERT_FALSE(HasFailure());
    }
  }
  EXPECT_GT(tally.refused, 1000U);
}

TEST(DamagedBytes, thatAreMessagesWrittenTwiceAgreeWithTheModel) {
  Tally tally;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= 20; ++number) {
      SCOPED_TRACE(number);
      RandomMessages random(number);
      const Bytes first = random.encoded(messageClass.name);
      const Bytes second = random.encoded(messageClass.name);
      compareWithModel(messageClass, testing::joined(first, second), tally);
      ASSERT_FALSE(HasFailure());
    }
  }
  EXPECT_EQ(tally.refused, 0U);
}

TEST(DamagedBytes, thatAreReadAreWrittenAsTheyShow) {
  Tally tally;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= 100; ++number) {
      SCOPED_TRACE(number);
      const testing::CapturedSystemLog log;
      RandomMessages random(number);
      const Bytes bytes = damaged(random, random.encoded(messageClass.name));
      const auto message = messageClass.decode(bytes);
      ++(message ? tally.decoded : tally.refused);
      if (!message) continue;
      const auto again = messageClass.decode(message->data());
      ASSERT_TRUE(again) << messageClass.name << ' ' << hexText(bytes);
      EXPECT_TRUE(again->isEqual(*message)) << messageClass.name << ' ' << hexText(bytes);
      EXPECT_EQ(again->data(), message->data());
    }
  }
  EXPECT_GT(tally.decoded, 1000U);
}

}  // namespace
}  // namespace qel
