#include "ui/quick/QuickRunLoop.h"

#include <gtest/gtest.h>

#include <QtTest/QTest>
#include <algorithm>
#include <thread>

#include "base/DispatchQueue.h"
#include "ui/kit/RunLoop.h"

namespace qel {
namespace {

struct Counter {
  void count() { ++fired; }
  int fired = 0;
};

TEST(QuickRunLoop, doesTheMainQueuesWorkInTheGUIThread) {
  const QuickRunLoop runLoop;
  std::thread::id worker;
  std::thread([&worker] {
    MainQueue::shared().async([&worker] { worker = std::this_thread::get_id(); });
  }).join();
  ASSERT_TRUE(QTest::qWaitFor([&worker] { return worker != std::thread::id(); }));
  EXPECT_EQ(worker, std::this_thread::get_id());
}

TEST(QuickRunLoop, doesWorkThatWaitedBeforeIt) {
  bool done = false;
  MainQueue::shared().async([&done] { done = true; });
  const QuickRunLoop runLoop;
  EXPECT_TRUE(QTest::qWaitFor([&done] { return done; }));
}

TEST(QuickRunLoop, doesALongQueueInBurstsAndInOrder) {
  const QuickRunLoop runLoop;
  constexpr int kItems = 10'000;
  std::vector<int> done;
  int bursts = 0;
  int lastBurst = 0;
  for (int i = 0; i < kItems; ++i) {
    MainQueue::shared().async([&done, i] { done.push_back(i); });
  }
  while (static_cast<int>(done.size()) < kItems) {
    QCoreApplication::sendPostedEvents();
    ASSERT_GT(static_cast<int>(done.size()), lastBurst);
    lastBurst = static_cast<int>(done.size());
    ++bursts;
  }
  EXPECT_GT(bursts, 10);
  EXPECT_TRUE(std::is_sorted(done.begin(), done.end()));
}

TEST(QuickRunLoop, firesTheMainRunLoopsTimersAgainAndAgain) {
  const QuickRunLoop runLoop;
  const auto counter = std::make_shared<Counter>();
  const auto timer =
      RepeatingTimer::scheduledTimer(std::chrono::milliseconds(1), counter, &Counter::count);
  EXPECT_TRUE(QTest::qWaitFor([&counter] { return counter->fired >= 3; }));
  timer->invalidate();
}

TEST(QuickRunLoop, workPostedAfterItsEndWaits) {
  { const QuickRunLoop runLoop; }
  bool done = false;
  MainQueue::shared().async([&done] { done = true; });
  QCoreApplication::processEvents();
  EXPECT_FALSE(done);
  MainQueue::shared().drain();
  EXPECT_TRUE(done);
}

}  // namespace
}  // namespace qel
