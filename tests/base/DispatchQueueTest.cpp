#include "base/DispatchQueue.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <future>
#include <memory>
#include <vector>

namespace qel {
namespace {

using namespace std::chrono_literals;

TEST(SerialQueue, runsWorkInOrderOnAThreadOfItsOwn) {
  SerialQueue queue("test.queue");
  std::vector<int> order;
  std::promise<std::thread::id> thread;
  for (int i = 0; i < 100; ++i) queue.async([&order, i] { order.push_back(i); });
  queue.async([&thread] { thread.set_value(std::this_thread::get_id()); });
  EXPECT_NE(thread.get_future().get(), std::this_thread::get_id());
  ASSERT_EQ(order.size(), 100U);
  EXPECT_TRUE(std::is_sorted(order.begin(), order.end()));
}

TEST(SerialQueue, keepsItsLabel) {
  EXPECT_EQ(SerialQueue("a.rather.long.queue.label").label(), "a.rather.long.queue.label");
}

TEST(SerialQueue, takesWorkFromItsOwnWork) {
  SerialQueue queue("test.queue");
  std::promise<void> inner;
  queue.async([&] { queue.async([&] { inner.set_value(); }); });
  EXPECT_EQ(inner.get_future().wait_for(10s), std::future_status::ready);
}

TEST(SerialQueue, dropsWaitingWorkAtItsEnd) {
  auto queue = std::make_unique<SerialQueue>("test.queue");
  auto dropped = std::make_shared<std::promise<void>>();
  auto gone = dropped->get_future();  // ready when the second item is run or dropped
  std::atomic<bool> ran = false;
  std::promise<void> bothQueued;
  SerialQueue& serial = *queue;
  serial.async([&queue, &bothQueued] {
    bothQueued.get_future().wait();
    queue.reset();
  });
  serial.async([&ran, held = std::move(dropped)] { ran = true; });
  bothQueued.set_value();
  ASSERT_EQ(gone.wait_for(10s), std::future_status::ready);
  EXPECT_FALSE(ran);
}

TEST(SerialQueue, canBeLetGoByItsOwnWork) {
  std::promise<void> done;
  auto queue = std::make_shared<SerialQueue>("test.queue");
  auto* raw = queue.get();
  raw->async([held = std::move(queue), &done]() mutable {
    held.reset();
    done.set_value();
  });
  EXPECT_EQ(done.get_future().wait_for(10s), std::future_status::ready);
}

TEST(MainQueue, runsWorkOnlyWhenDrained) {
  MainQueue queue;
  int runs = 0;
  queue.async([&] { ++runs; });
  EXPECT_EQ(runs, 0);
  EXPECT_FALSE(queue.drain());
  EXPECT_EQ(runs, 1);
}

TEST(MainQueue, leavesWorkThatWasAddedMeanwhile) {
  MainQueue queue;
  int runs = 0;
  queue.async([&] { queue.async([&] { ++runs; }); });
  EXPECT_TRUE(queue.drain());
  EXPECT_EQ(runs, 0);
  EXPECT_FALSE(queue.drain());
  EXPECT_EQ(runs, 1);
}

TEST(MainQueue, drainsNoMoreThanItIsAskedTo) {
  MainQueue queue;
  int runs = 0;
  for (int i = 0; i < 5; ++i) queue.async([&] { ++runs; });
  EXPECT_TRUE(queue.drain(3));
  EXPECT_EQ(runs, 3);
  EXPECT_FALSE(queue.drain(3));
  EXPECT_EQ(runs, 5);
}

TEST(MainQueue, callsItsWakerWhenItStopsBeingEmpty) {
  MainQueue queue;
  int wakes = 0;
  queue.setWaker([&] { ++wakes; });
  queue.async([] {});
  queue.async([] {});
  EXPECT_EQ(wakes, 1);
  queue.drain();
  queue.async([] {});
  EXPECT_EQ(wakes, 2);
}

TEST(MainQueue, waitsForWorkOfOtherThreads) {
  MainQueue queue;
  bool done = false;
  std::thread other([&] { queue.async([&] { done = true; }); });
  EXPECT_TRUE(queue.runUntil([&] { return done; }, 10s));
  other.join();
}

TEST(MainQueue, givesUpWhenTheTimeIsOver) {
  MainQueue queue;
  EXPECT_FALSE(queue.runUntil([] { return false; }, 1ms));
}

}  // namespace
}  // namespace qel
