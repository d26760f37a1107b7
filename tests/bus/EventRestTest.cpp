#include "tesk/bus/EventRest.h"

#include <gtest/gtest.h>

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

struct Resting {
  EventRest rest{200ms};
  EventRest::Clock::time_point now{1h};

  bool restsAfter(std::size_t events) { return rest.after(events, now) == now + 200ms; }
};

TEST(EventRest, LetsTheNextEventsComeTogether) {
  Resting client;
  EXPECT_TRUE(client.restsAfter(1));
  client.now += 200ms;
  EXPECT_TRUE(client.restsAfter(2));
}

TEST(EventRest, WaitsForTheNextOneOnceNoneCame) {
  Resting client;
  EXPECT_TRUE(client.restsAfter(1));
  client.now += 200ms;
  EXPECT_FALSE(client.restsAfter(0));
}

TEST(EventRest, IsNotForAClientInAHurry) {
  EventRest none{0ms};
  EXPECT_FALSE(none.after(1, EventRest::Clock::time_point{1h}));
}

TEST(EventRest, EndsWhileMuchComes) {
  Resting client;
  EXPECT_TRUE(client.restsAfter(EventRest::kMostPerSecond));
  client.now += 10ms;
  EXPECT_FALSE(client.restsAfter(1));
  client.now += 1s;
  EXPECT_FALSE(client.restsAfter(1)) << "much came in the second before";
  client.now += 1s;
  EXPECT_TRUE(client.restsAfter(1));
}

TEST(EventRest, KeepsTheRateOfAPhoneWithinItsRests) {
  Resting client;
  for (int i = 0; i < 1000; ++i) {
    client.now += 200ms;
    EXPECT_TRUE(client.restsAfter(2)) << "at ten a second";
  }
}

}  // namespace
}  // namespace tesk::bus
