// Merging messages of every class.
#include <gtest/gtest.h>

#include "ForAllClasses.h"

namespace qel {
namespace {

using testing::forAllClasses;
using testing::isPresent;
using testing::randomMessage;
using testing::sameEntry;

TEST(MergeFrom, anEmptyMessageChangesNothing) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto message = randomMessage<Message>(number);
    const auto before = message->deepCopy();
    message->mergeFrom(Message());
    EXPECT_TRUE(message->isEqual(*before));
    EXPECT_TRUE(message->dictionaryRepresentation() == before->dictionaryRepresentation());
  });
}

TEST(MergeFrom, intoAnEmptyMessageGivesAnEqualOneThatSharesWhatIsNested) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    Message merged;
    merged.mergeFrom(*source);
    EXPECT_TRUE(merged.isEqual(*source));
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      if constexpr (testing::kIsMessage<Field> || testing::kIsMessageList<Field>) {
        EXPECT_EQ(merged.*field.member, source.get()->*field.member) << field.key.view();
      }
    });
  });
}

// How one field must look after `source` was merged into what `before` is a deep copy of.
template <class Message, class Field>
void expectMerged(const Message& merged, const Message& before, const Message& source,
                  const Field& field) {
  const auto& ours = merged.*field.member;
  const auto& theirs = source.*field.member;
  if constexpr (testing::kIsMessageList<Field>) {
    const std::size_t kept = (before.*field.member).size();
    ASSERT_EQ(ours.size(), kept + theirs.size()) << field.key.view();
    for (std::size_t i = 0; i < theirs.size(); ++i) EXPECT_EQ(ours[kept + i], theirs[i]);
  } else if constexpr (testing::kIsPacked<Field>) {
    auto expected = (before.*field.member).values;
    for (const auto value : theirs.values) expected.push_back(value);
    EXPECT_EQ(ours.values, expected) << field.key.view();
  } else if constexpr (testing::kIsMessage<Field>) {
    ASSERT_EQ(static_cast<bool>(ours), isPresent(before, field) || isPresent(source, field));
    if (isPresent(before, field) && theirs) {
      EXPECT_NE(ours, theirs) << field.key.view() << " is merged, not taken over";
      auto expected = (before.*field.member)->deepCopy();
      expected->mergeFrom(*theirs);
      EXPECT_TRUE(ours->isEqual(*expected)) << field.key.view();
    } else if (theirs) {
      EXPECT_EQ(ours, theirs) << field.key.view() << " is taken over, not copied";
    }
  } else {
    const Message& origin = isPresent(source, field) ? source : before;
    EXPECT_TRUE(sameEntry(merged, origin, field.key)) << field.key.view();
  }
}

TEST(MergeFrom, growsListsMergesNestedMessagesAndReplacesTheRest) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    const auto message = randomMessage<Message>(number + 100);
    const auto before = message->deepCopy();
    message->mergeFrom(*source);
    forEachField<Message>(
        [&](const auto& field) { expectMerged(*message, *before, *source, field); });
  });
}

TEST(MergeFrom, itselfDoublesTheListsAndKeepsTheRest) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto message = randomMessage<Message>(number);
    const auto before = message->deepCopy();
    message->mergeFrom(*message);
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      const auto& now = (*message).*field.member;
      const auto& then = (*before).*field.member;
      if constexpr (testing::kIsMessageList<Field>) {
        EXPECT_EQ(now.size(), 2 * then.size()) << field.key.view();
      } else if constexpr (testing::kIsPacked<Field>) {
        EXPECT_EQ(now.count(), 2 * then.count()) << field.key.view();
      } else if constexpr (!testing::kIsMessage<Field>) {
        EXPECT_TRUE(sameEntry(*message, *before, field.key)) << field.key.view();
      }
    });
  });
}

TEST(AnotherClassDeathTest, inCopyToOrMergeFromEndsTheProgram) {
  const RxInfo info;
  KCellularLteRrcState state;
  EXPECT_DEATH(info.copyTo(state), "copyTo: KCellularLteRrcState is no RxInfo");
  EXPECT_DEATH(state.mergeFrom(info), "mergeFrom: RxInfo is no KCellularLteRrcState");
}

}  // namespace
}  // namespace qel
