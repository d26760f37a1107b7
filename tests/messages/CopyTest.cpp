// Copying messages of every class.
#include <gtest/gtest.h>

#include "ForAllClasses.h"

namespace qel {
namespace {

using testing::forAllClasses;
using testing::isPresent;
using testing::randomMessage;
using testing::sameEntry;

TEST(CopyTo, makesAnEmptyMessageEqualAndHashAlike) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    Message copy;
    source->copyTo(copy);
    EXPECT_TRUE(copy.isEqual(*source));
    EXPECT_EQ(copy.hash(), source->hash());
    EXPECT_TRUE(copy.dictionaryRepresentation() == source->dictionaryRepresentation());
  });
}

TEST(CopyTo, replacesWhatTheSourceHasAndLeavesTheRest) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    const auto before = randomMessage<Message>(number + 100);
    Message destination;
    before->copyTo(destination);
    source->copyTo(destination);
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      // A packed list is copied even when it is empty.
      const bool fromSource = testing::kIsPacked<Field> || isPresent(*source, field);
      const Message& origin = fromSource ? *source : *before;
      EXPECT_EQ(isPresent(destination, field), isPresent(origin, field)) << field.key.view();
      EXPECT_TRUE(sameEntry(destination, origin, field.key)) << field.key.view();
    });
  });
}

TEST(CopyTo, sharesNestedMessagesWithTheSource) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    Message copy;
    source->copyTo(copy);
    forEachField<Message>([&](const auto& field) {
      using Field = std::remove_cvref_t<decltype(field)>;
      if constexpr (testing::kIsMessage<Field> || testing::kIsMessageList<Field>) {
        EXPECT_EQ(copy.*field.member, source.get()->*field.member) << field.key.view();
      }
    });
  });
}

TEST(CopyWithZone, isEqualAndHashesAlike) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    const auto copy = source->copyWithZone();
    EXPECT_EQ(copy->className(), Message::kClassName);
    EXPECT_TRUE(copy->isEqual(*source));
    EXPECT_EQ(copy->hash(), source->hash());
    EXPECT_EQ(copy->data(), source->data());
  });
}

template <class Message>
void expectNothingShared(const Message& copy, const Message& source) {
  forEachField<Message>([&](const auto& field) {
    using Field = std::remove_cvref_t<decltype(field)>;
    const auto& copied = copy.*field.member;
    const auto& original = source.*field.member;
    if constexpr (testing::kIsMessage<Field>) {
      if (!original) return;
      EXPECT_NE(copied, original) << field.key.view();
      expectNothingShared(*copied, *original);
    } else if constexpr (testing::kIsMessageList<Field>) {
      ASSERT_EQ(copied.size(), original.size());
      for (std::size_t i = 0; i < copied.size(); ++i) {
        EXPECT_NE(copied[i], original[i]) << field.key.view();
        expectNothingShared(*copied[i], *original[i]);
      }
    }
  });
}

TEST(CopyWithZone, sharesNothingAllTheWayDown) {
  forAllClasses([]<class Message>(std::uint64_t number) {
    const auto source = randomMessage<Message>(number);
    expectNothingShared(*source->deepCopy(), *source);
  });
}

}  // namespace
}  // namespace qel
