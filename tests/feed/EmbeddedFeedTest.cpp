#include "feed/EmbeddedFeed.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <fstream>

#include "base/DispatchQueue.h"

namespace qel::testing {
namespace {

TEST(EmbeddedFeed, refusesWhatIsNoSource) {
  const auto book = std::make_shared<FeedBook>("nonsense", "system");
  sources::SourceError error;
  EXPECT_EQ(connectWithin("nonsense", *book, error), nullptr);
  EXPECT_EQ(error.exitCode, 64);
  EXPECT_NE(error.message, "");
}

TEST(EmbeddedFeed, tellsThatARecordingHasEnded) {
  const std::string path = ::testing::TempDir() + "ended.jsonl";
  std::ofstream(path) << R"({"time_ms": 1, "event": "trigger", "kKeyTriggerID": 8323091})"
                      << "\n";
  const std::string source = "recording:" + path;
  const auto book = std::make_shared<FeedBook>(source, "system");
  sources::SourceError error;
  const auto connector = connectWithin(source, *book, error);
  ASSERT_TRUE(connector) << error.message;
  const auto transport = connector->connect("test", [](std::string_view, tesk::Message) {});
  transport->eventsOn();
  EXPECT_TRUE(MainQueue::shared().runUntil([&] { return book->feed().hasEnded; },
                                           std::chrono::seconds(20)));
  EXPECT_EQ(book->feed().name, "ended.jsonl");
  std::remove(path.c_str());
}

}  // namespace
}  // namespace qel::testing
