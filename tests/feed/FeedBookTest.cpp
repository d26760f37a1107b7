#include "feed/FeedBook.h"

#include <gtest/gtest.h>

#include "base/DispatchQueue.h"
#include "tesk/bus/Reasons.h"

namespace qel::testing {
namespace {

using Texts = std::vector<std::string>;

struct StandingClock final : Clock {
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 1000;
};

class FeedOfTheBus : public ::testing::Test {
 protected:
  FeedOfTheBus() { book->setHistory(&history); }

  void reach(bool isReachable, std::string_view why = "") const {
    book->reachability()(isReachable, std::string(why));
    MainQueue::shared().drain();
  }
  void condition(const tesk::bus::Condition& told) const {
    book->condition()(told);
    MainQueue::shared().drain();
  }
  Texts happened() const {
    Texts texts;
    for (const Happening& happening : history.happenings()) {
      texts.push_back(std::string(nameOf(happening.kind)) + ": " + happening.text);
    }
    return texts;
  }

  StandingClock clock;
  History history;
  std::shared_ptr<FeedBook> book = std::make_shared<FeedBook>("", "system", clock);
};

TEST_F(FeedOfTheBus, isUnknownUntilItIsTold) {
  EXPECT_EQ(book->feed().kind, Feed::Kind::service);
  EXPECT_EQ(book->feed().reach, Feed::Reach::unknown);
}

TEST_F(FeedOfTheBus, knowsWhyThereIsNoService) {
  reach(false, tesk::bus::kNoPermission);
  EXPECT_EQ(book->feed().reach, Feed::Reach::noPermission);
  reach(false, tesk::bus::kNoBus);
  EXPECT_EQ(book->feed().reach, Feed::Reach::noBus);
  reach(false, tesk::bus::kTooManyClients);
  EXPECT_EQ(book->feed().reach, Feed::Reach::tooManyClients);
  reach(false, tesk::bus::kNotStarted);
  EXPECT_EQ(book->feed().reach, Feed::Reach::notRunning);
  EXPECT_EQ(happened(), Texts{});  // it was never there
}

TEST_F(FeedOfTheBus, takesAServiceThatTheSystemBusDoesNotKnowForNotInstalled) {
  reach(false, tesk::bus::kNotThere);
  EXPECT_EQ(book->feed().reach, Feed::Reach::notInstalled);
  const auto session = std::make_shared<FeedBook>("", "session", clock);
  session->reachability()(false, std::string(tesk::bus::kNotThere));
  MainQueue::shared().drain();
  EXPECT_EQ(session->feed().reach, Feed::Reach::notRunning);
}

TEST_F(FeedOfTheBus, keepsSinceWhenTheServiceIsLost) {
  reach(true);
  clock.timeMs = 5000;
  reach(false, tesk::bus::kNotThere);
  clock.timeMs = 9000;
  reach(false, tesk::bus::kNoAnswer);
  EXPECT_EQ(book->feed().lostSinceMs, 5000U);
  reach(true);
  EXPECT_FALSE(book->feed().lostSinceMs);
  EXPECT_EQ(book->feed().reach, Feed::Reach::there);
  EXPECT_EQ(happened(), (Texts{"service: Service found",
                               "service: Service lost: baseband manager service not reachable",
                               "service: Service found again"}));
}

TEST_F(FeedOfTheBus, namesTheModemAndTellsWhenItIsLostAndFound) {
  condition({"Registered with a network", "registered", "EG25-G"});
  EXPECT_EQ(book->feed().name, "EG25-G");
  EXPECT_EQ(book->feed().condition, "Registered with a network");
  condition({"No modem", "absent", ""});
  EXPECT_TRUE(book->feed().isWithoutModem);
  condition({"", "", ""});  // nothing is known: that is no modem found
  condition({"Modem starting", "starting", "EG25-G"});
  EXPECT_FALSE(book->feed().isWithoutModem);
  EXPECT_EQ(happened(),
            (Texts{"modem: Modem lost: No modem", "modem: Modem found: Modem starting"}));
}

TEST_F(FeedOfTheBus, tellsEachLossOnce) {
  int changes = 0;
  book->setObserver([&] { ++changes; });
  book->noteDropped(3);
  book->noteDropped(3);
  book->noteDropped(4);
  EXPECT_EQ(book->feed().dropped, 4U);
  EXPECT_EQ(changes, 2);
  EXPECT_EQ(happened(),
            (Texts{"gap: 3 reports left out, which came faster than they could be taken",
                   "gap: 1 report left out, which came faster than they could be taken"}));
}

TEST_F(FeedOfTheBus, mayBeGoneWhenSomethingIsTold) {
  const auto tell = book->reachability();
  book.reset();
  tell(true, "");
  MainQueue::shared().drain();
}

TEST(FeedOfASource, isNamedByItsText) {
  EXPECT_EQ(feedOf("simulated,seed=2").kind, Feed::Kind::simulated);
  const Feed recording = feedOf("recording:/tmp/drive.jsonl.gz,speed=2");
  EXPECT_EQ(recording.kind, Feed::Kind::recording);
  EXPECT_EQ(recording.name, "drive.jsonl.gz");
  EXPECT_EQ(recording.reach, Feed::Reach::there);
  const Feed log = feedOf("diag:/tmp/log.qmdl");
  EXPECT_EQ(log.kind, Feed::Kind::rawLog);
  EXPECT_EQ(log.name, "log.qmdl");
  EXPECT_EQ(feedOf("diag:/dev/ttyUSB0").kind, Feed::Kind::modem);
  EXPECT_EQ(feedOf("auto").kind, Feed::Kind::modem);
}

}  // namespace
}  // namespace qel::testing
