#include "tesk/EventBacklog.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <vector>

#include "tesk/Constants.h"

namespace tesk {
namespace {

using qel::Bytes;
using qel::Dictionary;

EventBacklog::Event metric(std::int64_t identifier, std::int64_t number, std::size_t bytes = 0) {
  return {
      std::string(kEventMetric),
      Dictionary{{"kKeyMetricID", identifier}, {"number", number}, {"kKeyPayload", Bytes(bytes)}}};
}

EventBacklog::Event trigger(std::int64_t number) {
  return {std::string(kEventTrigger), Dictionary{{"number", number}}};
}

std::vector<std::int64_t> takeAll(EventBacklog& backlog) {
  std::vector<std::int64_t> numbers;
  while (const auto event = backlog.take()) {
    numbers.push_back(event->entries.find("number")->asInt64().value());
  }
  return numbers;
}

using Numbers = std::vector<std::int64_t>;

TEST(EventBacklog, givesEventsInTheirOrder) {
  EventBacklog backlog;
  EXPECT_TRUE(backlog.add(metric(1, 10)));
  EXPECT_TRUE(backlog.add(trigger(11)));
  EXPECT_TRUE(backlog.add(metric(1, 12)));
  EXPECT_EQ(takeAll(backlog), (Numbers{10, 11, 12}));
  EXPECT_TRUE(backlog.isEmpty());
  EXPECT_EQ(backlog.dropped(), 0U);
}

// Events waited without limit for a thread that was slower than they came.
TEST(EventBacklog, dropsTheOldestBeyondItsNumber) {
  EventBacklog backlog({.events = 3});
  for (int i = 0; i < 10; ++i) static_cast<void>(backlog.add(metric(1, i)));
  EXPECT_EQ(backlog.dropped(), 7U);
  EXPECT_EQ(takeAll(backlog), (Numbers{7, 8, 9}));
}

TEST(EventBacklog, sparesTheNewestOfEveryMetric) {
  EventBacklog backlog({.events = 3});
  static_cast<void>(backlog.add(metric(7, 0)));  // the only one of its metric, and the oldest
  for (int i = 1; i < 10; ++i) static_cast<void>(backlog.add(metric(1, i)));
  EXPECT_EQ(takeAll(backlog), (Numbers{0, 8, 9}));
}

TEST(EventBacklog, dropsTriggersBeforeTheNewestOfAMetric) {
  EventBacklog backlog({.events = 3});
  for (int i = 0; i < 3; ++i) static_cast<void>(backlog.add(trigger(i)));
  for (int i = 3; i < 6; ++i) static_cast<void>(backlog.add(metric(i, i)));
  EXPECT_EQ(takeAll(backlog), (Numbers{3, 4, 5}));
}

TEST(EventBacklog, staysWithinItsNumberThoughEveryEventIsTheOnlyOneOfItsMetric) {
  EventBacklog backlog({.events = 3});
  for (int i = 0; i < 100; ++i) static_cast<void>(backlog.add(metric(i, i)));
  EXPECT_EQ(takeAll(backlog), (Numbers{97, 98, 99}));
  EXPECT_EQ(backlog.dropped(), 97U);
}

TEST(EventBacklog, staysWithinItsBytes) {
  EventBacklog backlog({.bytes = 10'000});
  for (int i = 0; i < 100; ++i) static_cast<void>(backlog.add(metric(i % 2, i, 3'000)));
  EXPECT_EQ(takeAll(backlog), (Numbers{97, 98, 99}));
  EXPECT_FALSE(backlog.add(metric(1, 100, 20'000))) << "larger than all that may wait";
  EXPECT_TRUE(backlog.isEmpty());
  EXPECT_EQ(backlog.dropped(), 98U);
}

// What was nested counted for nothing: lists of a recording filled the memory.
TEST(EventBacklog, weighsWhatIsNested) {
  EventBacklog backlog({.bytes = 100'000});
  const auto nested = [](std::int64_t number) {
    EventBacklog::Event event = metric(number, number);
    qel::List list;
    for (int i = 0; i < 1'000; ++i) list.push_back(Dictionary{{"text", std::string(20, 't')}});
    event.entries.set("list", std::move(list));
    return event;
  };
  for (int i = 0; i < 10; ++i) static_cast<void>(backlog.add(nested(i)));
  const Numbers left = takeAll(backlog);
  EXPECT_GE(left.size(), 1U);
  EXPECT_LE(left.size(), 5U) << "each holds 20,000 bytes of text alone";
  EXPECT_EQ(left.back(), 9);
}

TEST(EventBacklog, asksForNoMoreWorkThanEventsMayWait) {
  EventBacklog backlog({.events = 4});
  int asked = 0;
  for (int i = 0; i < 1000; ++i) asked += backlog.add(metric(1, i)) ? 1 : 0;
  EXPECT_EQ(asked, 4);
  for (int i = 0; i < asked; ++i) EXPECT_TRUE(backlog.take());
  EXPECT_TRUE(backlog.add(metric(1, 0))) << "and asks anew";
}

// Whatever comes and goes: what was added was taken or dropped, in order, and whoever takes it all
// ends with the newest of every metric.
TEST(EventBacklog, losesNoMetricsNewest) {
  std::mt19937 random(1);
  for (int round = 0; round < 200; ++round) {
    EventBacklog backlog({.events = 40, .bytes = 60'000});
    std::map<std::int64_t, std::int64_t> newest;
    std::map<std::int64_t, std::int64_t> seen;
    std::int64_t last = -1;
    std::uint64_t taken = 0;
    const auto take = [&] {
      const auto event = backlog.take();
      if (!event) return false;
      const std::int64_t number = event->entries.find("number")->asInt64().value();
      EXPECT_GT(number, last);
      last = number;
      seen[event->entries.find("kKeyMetricID")->asInt64().value()] = number;
      ++taken;
      return true;
    };
    constexpr int kEvents = 1000;
    for (int i = 0; i < kEvents; ++i) {
      const auto identifier = static_cast<std::int64_t>(random() % 20);
      newest[identifier] = i;
      static_cast<void>(backlog.add(metric(identifier, i, random() % 1000)));
      if (random() % 5 == 0) take();
    }
    while (take()) {
    }
    EXPECT_EQ(seen, newest);
    EXPECT_EQ(taken + backlog.dropped(), static_cast<std::uint64_t>(kEvents));
  }
}

}  // namespace
}  // namespace tesk
