#include "ui/quick/pages/BootTimer.h"

#include <gtest/gtest.h>

#include <QtTest/QTest>
#include <filesystem>
#include <fstream>
#include <set>
#include <string>

namespace qel {
namespace {

using namespace std::chrono_literals;

// The clocks of all timers that this process has from the kernel.
std::multiset<int> clocksOfTimers() {
  std::multiset<int> clocks;
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fdinfo")) {
    std::ifstream file(entry.path());
    for (std::string word; file >> word;) {
      int clock = -1;
      if (word == "clockid:" && file >> clock) clocks.insert(clock);
    }
  }
  return clocks;
}

TEST(BootTimer, goesOnWhileTheDeviceSleeps) {
  const auto before = clocksOfTimers().count(CLOCK_BOOTTIME);
  const BootTimer timer;
  EXPECT_EQ(clocksOfTimers().count(CLOCK_BOOTTIME), before + 1);
}

TEST(BootTimer, firesOnce) {
  BootTimer timer;
  int fired = 0;
  QObject::connect(&timer, &BootTimer::timeout, [&fired] { ++fired; });
  timer.start(1ms);
  EXPECT_TRUE(timer.isActive());
  EXPECT_TRUE(QTest::qWaitFor([&fired] { return fired > 0; }));
  EXPECT_FALSE(timer.isActive());
  QTest::qWait(50);
  EXPECT_EQ(fired, 1);
}

TEST(BootTimer, firesAtOnceWhenThereIsNothingToWaitFor) {
  BootTimer timer;
  bool fired = false;
  QObject::connect(&timer, &BootTimer::timeout, [&fired] { fired = true; });
  timer.start(0ms);
  EXPECT_TRUE(QTest::qWaitFor([&fired] { return fired; }));
}

TEST(BootTimer, keepsStillOnceStoppedAndCanBeSetAnew) {
  BootTimer timer;
  int fired = 0;
  QObject::connect(&timer, &BootTimer::timeout, [&fired] { ++fired; });
  timer.start(1ms);
  timer.stop();
  QTest::qWait(50);
  EXPECT_EQ(fired, 0);
  timer.start(1h);
  timer.start(1ms);
  EXPECT_TRUE(QTest::qWaitFor([&fired] { return fired == 1; }));
}

}  // namespace
}  // namespace qel
