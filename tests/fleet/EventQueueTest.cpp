#include "fleet/EventQueue.h"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include "fleet/Folder.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr std::uint64_t kNow = 1'700'000'000'000;
constexpr std::size_t kAll = 1'000'000;

class SetClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return now; }
  std::uint64_t now = kNow;
};

class EventQueueTest : public ::testing::Test {
 protected:
  std::unique_ptr<EventQueue> open(EventQueue::Limits limits = {}) {
    std::string error;
    auto queue = EventQueue::open(folder.path() + "/state", limits, error, clock);
    EXPECT_TRUE(queue) << error;
    return queue;
  }

  static std::vector<std::uint64_t> numbersIn(EventQueue& queue, std::uint64_t after = 0) {
    EXPECT_TRUE(queue.settle());
    std::vector<std::uint64_t> numbers;
    for (const QueuedEvent& event : queue.next(after, kAll)) numbers.push_back(event.number);
    return numbers;
  }
  using Numbers = std::vector<std::uint64_t>;

  testing::Folder folder;
  SetClock clock;
};

TEST_F(EventQueueTest, givesWhatItTookInTurn) {
  const auto queue = open();
  EXPECT_TRUE(queue->add(kNow, "a", "{1}"));
  EXPECT_TRUE(queue->add(kNow, "b", "{22}"));
  ASSERT_TRUE(queue->settle());
  const auto events = queue->next(0, kAll);
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[0].number, 1U);
  EXPECT_EQ(events[0].metric, "a");
  EXPECT_EQ(events[1].line, "{22}");
  EXPECT_EQ(queue->counts().waiting, 2U);
  EXPECT_EQ(queue->counts().waitingBytes, 7U);
  EXPECT_EQ(numbersIn(*queue, 1), Numbers({2}));
}

TEST_F(EventQueueTest, showsNoNumberThatThePowerCouldTake) {
  const auto queue = open();
  queue->add(kNow, "a", "{}");
  EXPECT_TRUE(queue->next(0, kAll).empty());
  ASSERT_TRUE(queue->settle());
  queue->add(kNow, "a", "{}");
  EXPECT_EQ(queue->next(0, kAll).size(), 1U);
}

TEST_F(EventQueueTest, givesAPartButOneAtLeast) {
  const auto queue = open();
  for (int i = 0; i < 4; ++i) queue->add(kNow, "a", "0123456789");
  ASSERT_TRUE(queue->settle());
  EXPECT_EQ(queue->next(0, 1).size(), 1U);
  EXPECT_EQ(queue->next(0, 11).size(), 2U);
  EXPECT_EQ(queue->next(0, 40).size(), 4U);
}

TEST_F(EventQueueTest, keepsWhatHasNotArrived) {
  std::uint32_t stream = 0;
  {
    const auto queue = open();
    stream = queue->stream();
    for (int i = 0; i < 4; ++i) queue->add(kNow, "a", "{}");
    EXPECT_TRUE(queue->remove(Numbers({1, 3, 99})));
  }
  const auto queue = open();
  EXPECT_EQ(queue->stream(), stream);
  EXPECT_EQ(queue->counts().waiting, 2U);
  EXPECT_EQ(queue->counts().waitingBytes, 4U);
  EXPECT_EQ(numbersIn(*queue), Numbers({2, 4}));
}

TEST_F(EventQueueTest, givesNoNumberTwice) {
  {
    const auto queue = open();
    for (int i = 0; i < 3; ++i) queue->add(kNow, "a", "{}");
    EXPECT_TRUE(queue->remove(Numbers({1, 2, 3})));
  }
  const auto queue = open();
  queue->add(kNow, "a", "{}");
  EXPECT_EQ(numbersIn(*queue), Numbers({4}));
}

TEST_F(EventQueueTest, dropsTheOldestBeyondItsBytes) {
  {
    const auto queue = open({.bytes = 30, .age = 24h});
    for (int i = 0; i < 5; ++i) queue->add(kNow, "a", "0123456789");
    EXPECT_EQ(numbersIn(*queue), Numbers({3, 4, 5}));
    EXPECT_EQ(queue->counts().dropped, 2U);
    EXPECT_EQ(queue->counts().waitingBytes, 30U);
  }
  const auto queue = open({.bytes = 10, .age = 24h});
  EXPECT_EQ(queue->counts().dropped, 4U);
  EXPECT_EQ(numbersIn(*queue), Numbers({5}));
}

TEST_F(EventQueueTest, remembersHowManyWereTooLarge) {
  {
    const auto queue = open();
    for (int i = 0; i < 3; ++i) queue->add(kNow, "a", "{}");
    queue->leaveOut();
    queue->leaveOut();
    EXPECT_EQ(queue->counts().tooLarge, 2U);
    EXPECT_TRUE(queue->remove(Numbers({1, 2})));
  }
  const auto queue = open();
  EXPECT_EQ(queue->counts().tooLarge, 2U);
  EXPECT_EQ(numbersIn(*queue), Numbers({3}));
}

// Had it been counted before it was removed, it would be counted again.
TEST_F(EventQueueTest, countsNothingTwiceThatIsStillThere) {
  {
    const auto queue = open();
    queue->add(kNow, "a", "{}");
    queue->leaveOut();
  }
  const auto queue = open();
  EXPECT_EQ(queue->counts().tooLarge, 0U);
  EXPECT_EQ(numbersIn(*queue), Numbers({1}));
}

TEST_F(EventQueueTest, dropsNothingThatIsBeingSent) {
  const auto queue = open({.bytes = 30, .age = 24h});
  for (int i = 0; i < 3; ++i) queue->add(kNow, "a", "0123456789");
  ASSERT_TRUE(queue->settle());
  ASSERT_EQ(queue->next(0, 11).size(), 2U);
  queue->add(kNow, "a", "0123456789");
  EXPECT_EQ(numbersIn(*queue), Numbers({1, 2, 4}));
  queue->sendAgain();
  queue->add(kNow, "a", "0123456789");
  EXPECT_EQ(numbersIn(*queue), Numbers({2, 4, 5}));
}

TEST_F(EventQueueTest, dropsWhatIsTooOld) {
  const auto queue = open({.bytes = 1000, .age = 24h});
  queue->add(kNow, "a", "{}");
  queue->add(kNow + 1000, "a", "{}");
  clock.now = kNow + std::chrono::milliseconds(24h).count() + 500;
  queue->add(clock.now, "a", "{}");
  EXPECT_EQ(numbersIn(*queue), Numbers({2, 3}));
  EXPECT_EQ(queue->counts().dropped, 1U);
}

// A phone that has started and not yet heard the time says 1970.
TEST_F(EventQueueTest, takesAnEventWithoutATimeForAsOldAsTheNextOne) {
  const auto queue = open({.bytes = 1000, .age = 24h});
  clock.now = 5000;
  queue->add(5000, "a", "{}");
  clock.now = kNow;
  queue->add(kNow, "a", "{}");
  EXPECT_EQ(numbersIn(*queue), Numbers({1, 2}));
  clock.now = kNow + std::chrono::milliseconds(48h).count();
  queue->sendAgain();
  queue->add(clock.now, "a", "{}");
  EXPECT_EQ(numbersIn(*queue), Numbers({3}));
}

TEST_F(EventQueueTest, isOneProcesssAlone) {
  const auto queue = open();
  std::string error;
  EXPECT_FALSE(EventQueue::open(folder.path() + "/state", {}, error, clock));
  EXPECT_EQ(error, folder.path() + "/state/publish.db: is used by another process");
}

TEST_F(EventQueueTest, isForItsOwnerAlone) {
  open()->add(kNow, "a", "{}");
  using std::filesystem::perms;
  const std::string state = folder.path() + "/state";
  EXPECT_EQ(std::filesystem::status(state).permissions(), perms(0700));
  EXPECT_EQ(std::filesystem::status(state + "/publish.db").permissions(), perms(0600));
}

TEST_F(EventQueueTest, ofAnotherVersionIsLeftAlone) {
  open().reset();
  const std::string path = folder.path() + "/state/publish.db";
  sqlite3* database = nullptr;
  ASSERT_EQ(sqlite3_open(path.c_str(), &database), SQLITE_OK);
  ASSERT_EQ(sqlite3_exec(database, "PRAGMA user_version = 9", nullptr, nullptr, nullptr),
            SQLITE_OK);
  sqlite3_close(database);
  std::string error;
  EXPECT_FALSE(EventQueue::open(folder.path() + "/state", {}, error, clock));
  EXPECT_EQ(error, path + ": was made by another version of the program");
}

}  // namespace
}  // namespace qel::fleet
