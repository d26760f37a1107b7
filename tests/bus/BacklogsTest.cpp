#include "service/bus/Backlogs.h"

#include <gtest/gtest.h>

#include <array>

namespace qel::service {
namespace {

constexpr std::size_t kPacket = 1000;

class BacklogsTest : public ::testing::Test {
 protected:
  BacklogsTest() {
    for (Backlog& backlog : frozen) backlogs.add(backlog);
    backlogs.add(reader);
  }
  void push(Backlog& backlog, std::uint8_t mark = 0) {
    backlogs.push(backlog, Bytes(kPacket, mark));
  }

  Backlogs backlogs;
  std::array<Backlog, 63> frozen;
  Backlog reader;
};

// One mebibyte for each of 63 clients that did not read was more than the service may use.
TEST_F(BacklogsTest, ClientsThatDoNotReadShareOneTotal) {
  std::size_t pushed = 0;
  for (int i = 0; i < 1000; ++i) {
    for (Backlog& backlog : frozen) {
      push(backlog);
      ++pushed;
      ASSERT_LE(backlogs.bytes(), Backlogs::kLargestTotal);
    }
  }
  std::size_t waiting = 0;
  std::size_t dropped = 0;
  for (const Backlog& backlog : frozen) {
    waiting += backlog.packets.size();
    dropped += backlog.dropped;
    EXPECT_GT(backlog.packets.size(), 0U);
  }
  EXPECT_EQ(waiting + dropped, pushed);
}

TEST_F(BacklogsTest, AClientThatReadsLosesNothingBecauseOthersDoNot) {
  for (int i = 0; i < 1000; ++i) {
    for (Backlog& backlog : frozen) push(backlog);
    push(reader);
    if (i % 10 == 9) {
      while (!reader.packets.empty()) backlogs.pop(reader);
    }
  }
  EXPECT_EQ(reader.dropped, 0U);
}

TEST_F(BacklogsTest, TheLargestLosesItsOldest) {
  for (int i = 0; i < 800; ++i) push(frozen[0], i == 0 ? 1 : 2);
  for (std::size_t one = 1; one < 5; ++one) {
    for (int i = 0; i < 789; ++i) push(frozen[one]);
  }
  EXPECT_GT(frozen[0].dropped, 0U);
  EXPECT_EQ(frozen[0].packets.front()[0], 2);
  for (std::size_t one = 1; one < 5; ++one) EXPECT_LE(frozen[one].dropped, frozen[0].dropped);
}

TEST_F(BacklogsTest, OneAloneKeepsAMebibyte) {
  for (int i = 0; i < 3000; ++i) push(frozen[0]);
  EXPECT_LE(frozen[0].bytes, Backlogs::kLargest);
  EXPECT_GT(frozen[0].bytes, Backlogs::kLargest - 2 * kPacket);
}

TEST_F(BacklogsTest, WhatAClientThatGoesLeavesIsFreeForOthers) {
  for (int i = 0; i < 100; ++i) push(frozen[0]);
  backlogs.remove(frozen[0]);
  EXPECT_EQ(backlogs.bytes(), 0U);
}

}  // namespace
}  // namespace qel::service
