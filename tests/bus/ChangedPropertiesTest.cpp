#include "service/bus/ChangedProperties.h"

#include <gtest/gtest.h>

namespace qel::service {
namespace {

using namespace std::chrono_literals;
using Names = std::vector<std::string>;

class ChangedPropertiesTest : public ::testing::Test {
 protected:
  ChangedProperties changed;
  const ChangedProperties::Moment start{1h};
};

TEST_F(ChangedPropertiesTest, HasNothingToTellAtFirst) {
  EXPECT_FALSE(changed.due());
  EXPECT_TRUE(changed.take(start).empty());
}

TEST_F(ChangedPropertiesTest, TellsAFirstChangeAtOnce) {
  changed.note({"Clients"});
  EXPECT_LE(*changed.due(), start);
  EXPECT_EQ(changed.take(start), (Names{"Clients"}));
  EXPECT_FALSE(changed.due());
}

// Every call sent a signal of its own to everybody.
TEST_F(ChangedPropertiesTest, TellsManyChangesTogetherAndNamesEachPropertyOnce) {
  changed.note({"Clients"});
  changed.take(start);
  for (int i = 0; i < 1000; ++i) changed.note({"Clients", "SourceRunning"});
  EXPECT_EQ(*changed.due(), start + ChangedProperties::kSpacing);
  EXPECT_TRUE(changed.take(start + ChangedProperties::kSpacing - 1ms).empty());
  EXPECT_EQ(changed.take(start + ChangedProperties::kSpacing), (Names{"Clients", "SourceRunning"}));
}

TEST_F(ChangedPropertiesTest, TellsAtOnceAgainAfterAQuietTime) {
  changed.note({"Clients"});
  changed.take(start);
  changed.note({"Configurations"});
  EXPECT_EQ(changed.take(start + 10s), (Names{"Configurations"}));
}

}  // namespace
}  // namespace qel::service
