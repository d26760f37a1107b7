#include "service/ConditionBook.h"

#include <gmock/gmock.h>

#include "support/RecordingSink.h"

namespace qel {
namespace {

using service::ConditionBook;
using sources::SourceCondition;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::SizeIs;

const SourceCondition kLocked = {"locked", "Modem locked", "SIM PIN needed", "X 100", "qmi_wwan"};
const SourceCondition kAbsent = {"absent", "No modem", ""};

class FakeClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 1'000'000;
};

class ConditionBookTest : public ::testing::Test {
 protected:
  testing::CapturedSystemLog log;
  FakeClock clock;
  ConditionBook book{clock};
};

TEST_F(ConditionBookTest, WritesOneLineForEachChange) {
  book.note(kLocked);
  book.note(kLocked);
  book.note(kAbsent);
  EXPECT_THAT(
      log.lines(),
      ElementsAre("baseband source: Modem locked: SIM PIN needed, model X 100, driver qmi_wwan",
                  "baseband source: No modem"));
}

TEST_F(ConditionBookTest, DoesNotFillTheLogWhenAModemComesAndGoes) {
  for (int i = 0; i < 1000; ++i) book.note(i % 2 == 0 ? kLocked : kAbsent);
  ASSERT_THAT(log.lines(), SizeIs(10));
  EXPECT_THAT(log.lines().back(), HasSubstr("further changes"));
  EXPECT_EQ(book.current(), kAbsent);
  clock.timeMs += 60'000;
  book.note(kLocked);
  EXPECT_THAT(log.lines(), SizeIs(11));
}

TEST_F(ConditionBookTest, TellsItsObserverOfChangesAlone) {
  int told = 0;
  book.observe([&] { ++told; });
  book.note(kLocked);
  book.note(kLocked);
  EXPECT_EQ(told, 1);
  book.forget();
  EXPECT_EQ(told, 2);
  EXPECT_EQ(book.current(), SourceCondition());
  book.forget();
  EXPECT_EQ(told, 2);
  book.observe({});
  book.note(kLocked);
  EXPECT_EQ(told, 2);
}

}  // namespace
}  // namespace qel
