#include "feed/EmbeddedFeed.h"

#include <gtest/gtest.h>

namespace qel::testing {
namespace {

TEST(EmbeddedFeed, refusesWhatIsNoSource) {
  const auto book = std::make_shared<FeedBook>("nonsense", "system");
  sources::SourceError error;
  EXPECT_EQ(connectWithin("nonsense", *book, error), nullptr);
  EXPECT_EQ(error.exitCode, 64);
  EXPECT_NE(error.message, "");
}

}  // namespace
}  // namespace qel::testing
