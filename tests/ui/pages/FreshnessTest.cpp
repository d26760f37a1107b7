#include "ui/pages/Freshness.h"

#include <gtest/gtest.h>

#include <set>

#include "support/FixedTimeZone.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

const FixedTimeZone kUtc(0, "UTC");

TEST(Freshness, SaysWhatFeedsTheViewer) {
  const Scene scene;
  const auto source = [&](const Feed& feed) {
    return freshness(feed, scene.viewpoint(), kUtc).source;
  };
  Feed feed;
  EXPECT_EQ(source(feed), "Baseband manager");
  feed.name = "EG25-G";
  EXPECT_EQ(source(feed), "Baseband manager, modem EG25-G");
  feed.kind = Feed::Kind::modem;
  EXPECT_EQ(source(feed), "Modem EG25-G");
  feed.kind = Feed::Kind::simulated;
  EXPECT_EQ(source(feed), "Simulated modem");
  feed.kind = Feed::Kind::recording;
  feed.name = "drive.jsonl";
  feed.positionMs = 65'000;
  feed.lengthMs = 3'725'000;
  EXPECT_EQ(source(feed), "Recording drive.jsonl, 01:05 of 1:02:05");
  feed.hasEnded = true;
  EXPECT_EQ(source(feed), "Recording drive.jsonl, 01:05 of 1:02:05, ended");
}

TEST(Freshness, TellsOfASilenceOfThreePeriods) {
  Scene scene;
  scene.signals(0, 60'000, -90);
  scene.at(75'000);
  Freshness fresh = freshness({}, scene.viewpoint(), kUtc);
  EXPECT_EQ(fresh.state, "connected");
  EXPECT_TRUE(fresh.isFlowing);
  EXPECT_EQ(fresh.bar, "");
  EXPECT_EQ(fresh.changesAtMs, kStartMs + 75'001);
  scene.at(75'001);
  fresh = freshness({}, scene.viewpoint(), kUtc);
  EXPECT_EQ(fresh.state, "connected, but no reports since 08:01");
  EXPECT_FALSE(fresh.isFlowing);
  EXPECT_EQ(fresh.bar, "Connected, but no reports since 08:01");
  EXPECT_FALSE(fresh.changesAtMs);
}

TEST(Freshness, IsPatientWithReportsThatComeSlowly) {
  Scene scene;
  for (std::uint64_t time = 0; time <= 120'000; time += 30'000) {
    scene.at(time);
    scene.signal(-90, -9, 25);
  }
  scene.at(120'000 + 80'000);
  EXPECT_TRUE(freshness({}, scene.viewpoint(), kUtc).isFlowing);
  scene.at(120'000 + 100'000);
  EXPECT_FALSE(freshness({}, scene.viewpoint(), kUtc).isFlowing);
}

TEST(Freshness, ExpectsNothingOfWhatHasEnded) {
  Scene scene;
  scene.signals(0, 1'000, -90);
  scene.at(600'000);
  Feed feed;
  feed.kind = Feed::Kind::recording;
  feed.hasEnded = true;
  EXPECT_TRUE(freshness(feed, scene.viewpoint(), kUtc).isFlowing);
  EXPECT_TRUE(freshness({}, scene.viewpoint(false), kUtc).isFlowing);
}

// Once only the log knew.
TEST(Freshness, SaysWhyAFileHasEndedBeforeItsEnd) {
  const Scene scene;
  Feed feed;
  feed.kind = Feed::Kind::recording;
  feed.name = "drive.jsonl";
  feed.hasEnded = true;
  feed.condition = "Recording has ended";
  EXPECT_EQ(freshness(feed, scene.viewpoint(), kUtc).footer, "Recording drive.jsonl, ended");
  feed.reason = "line 9: not JSON, column 1";
  EXPECT_EQ(freshness(feed, scene.viewpoint(), kUtc).footer,
            "Recording drive.jsonl, ended\nLine 9: not JSON, column 1");
}

TEST(Freshness, HasWordsOfItsOwnForEachReasonWhyThereIsNoService) {
  const Scene scene;
  std::set<std::string> states;
  std::set<std::string> advices;
  for (const auto reach :
       {Feed::Reach::notInstalled, Feed::Reach::notRunning, Feed::Reach::noPermission,
        Feed::Reach::noBus, Feed::Reach::tooManyClients, Feed::Reach::noAnswer,
        Feed::Reach::refused}) {
    Feed feed;
    feed.reach = reach;
    const Freshness fresh = freshness(feed, scene.viewpoint(), kUtc);
    EXPECT_FALSE(fresh.isFlowing);
    EXPECT_TRUE(fresh.state.starts_with("Baseband manager: ")) << fresh.state;
    EXPECT_NE(fresh.advice, "") << fresh.state;
    states.insert(fresh.state);
    advices.insert(fresh.advice);
  }
  EXPECT_EQ(states.size(), 7U);
  EXPECT_EQ(advices.size(), 7U);
}

TEST(Freshness, SaysSinceWhenTheServiceIsLost) {
  const Scene scene;
  Feed feed;
  feed.reach = Feed::Reach::notRunning;
  feed.lostSinceMs = kStartMs + 21 * 60'000;
  EXPECT_EQ(freshness(feed, scene.viewpoint(), kUtc).state,
            "Baseband manager: not running, lost at 08:21");
}

TEST(Freshness, CountsWhatWasLeftOut) {
  const Scene scene;
  Feed feed;
  feed.dropped = 12'345;
  const Freshness fresh = freshness(feed, scene.viewpoint(), kUtc);
  EXPECT_EQ(fresh.loss, "12,345 reports left out, which came faster than they could be taken");
  EXPECT_NE(fresh.footer.find(fresh.loss), std::string::npos);
}

}  // namespace
}  // namespace qel::testing
