// Comparing and hashing messages of every class.
#include <gtest/gtest.h>

#include "ForAllClasses.h"

namespace qel {
namespace {

using testing::forAllClasses;
using testing::isPresent;
using testing::randomMessage;

TEST(IsEqual, isOnlyTrueForExactlyTheSameClass) {
  for (const auto& one : testing::messageClasses()) {
    for (const auto& other : testing::messageClasses()) {
      EXPECT_EQ(one.make()->isEqual(*other.make()), one.name == other.name)
          << one.name << " and " << other.name;
    }
  }
}

TEST(IsEqual, noticesEveryFieldThatBecomesAbsent) {
  std::size_t noticed = 0;
  forAllClasses([&]<class Message>(std::uint64_t number) {
    const auto message = randomMessage<Message>(number);
    forEachField<Message>([&](const auto& field) {
      if (!isPresent(*message, field)) return;
      const auto other = message->deepCopy();
      testing::makeAbsent(*other, field);
      EXPECT_FALSE(other->isEqual(*message)) << field.key.view();
      EXPECT_FALSE(message->isEqual(*other)) << field.key.view();
      ++noticed;
    });
  });
  EXPECT_GT(noticed, 1000U);
}

TEST(IsEqual, noticesEveryScalarThatChanges) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto message = randomMessage<Message>(number);
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      if constexpr (testing::kIsScalar<Field>) {
        if (!isPresent(*message, field)) return;
        const auto other = message->deepCopy();
        auto& value = (*other).*field.member;
        value = static_cast<std::remove_cvref_t<decltype(value)>>(!value);
        EXPECT_FALSE(other->isEqual(*message)) << field.key.view();
      }
    });
  });
}

TEST(IsEqual, ignoresWhatIsStoredUnderAClearPresenceBit) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto message = randomMessage<Message>(number);
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      if constexpr (testing::kIsScalar<Field>) {
        if (isPresent(*message, field)) return;
        const auto other = message->deepCopy();
        (*other).*field.member = 1;
        EXPECT_TRUE(other->isEqual(*message)) << field.key.view();
        EXPECT_EQ(other->hash(), message->hash()) << field.key.view();
        EXPECT_EQ(other->data(), message->data()) << field.key.view();
      }
    });
  });
}

TEST(Hash, isTheExclusiveOrOfThePresentScalarsTimesAFactor) {
  constexpr std::uint64_t kFactor = 2654435761;
  KCellularLteRrcState state;
  EXPECT_EQ(state.hash(), 0U);
  state.setTimestamp(1000);
  state.setState(3);
  EXPECT_EQ(state.hash(), (1000 * kFactor) ^ (3 * kFactor));

  RxInfo info;
  info.setRssi(-2);
  EXPECT_EQ(info.hash(), static_cast<std::uint64_t>(std::int64_t{-2}) * kFactor)
      << "signed values widen with their sign";
  RxInfo range;
  range.setRsrpRange(0xFFFFFFFE);
  EXPECT_EQ(range.hash(), 0xFFFFFFFE * kFactor) << "unsigned ones with zeros";

  KCellularLteServingCellMeasurement measurement;
  measurement.setIsConnectedMode(true);
  EXPECT_EQ(measurement.hash(), kFactor);
}

}  // namespace
}  // namespace qel
