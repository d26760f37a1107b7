#include "service/bus/EventStream.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>

#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"

namespace qel::service {
namespace {

class EventStreamTest : public ::testing::Test {
 protected:
  EventStreamTest() {
    std::array<int, 2> ends{};
    EXPECT_EQ(::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK, 0, ends.data()), 0);
    _client = ends[1];
    stream = std::make_unique<EventStream>(ends[0], [this] { ++backlogs; });
  }
  ~EventStreamTest() override { closeClient(); }

  void closeClient() {
    if (_client >= 0) ::close(_client);
    _client = -1;
  }

  void send(std::int64_t number) {
    stream->send(tesk::kEventMetric,
                 tesk::Message(Dictionary{{"number", number}, {"kKeyPayload", Bytes(1000)}}));
  }

  // The numbers of the events that the client can read now.
  std::vector<std::int64_t> received() const {
    std::vector<std::int64_t> numbers;
    Bytes packet(tesk::bus::kLargestPacket);
    ssize_t size = 0;
    while ((size = ::recv(_client, packet.data(), packet.size(), 0)) > 0) {
      const auto event = tesk::bus::decodeEvent({packet.data(), static_cast<std::size_t>(size)});
      numbers.push_back(*event->message.entries().find("number")->asInt64());
    }
    return numbers;
  }

  std::unique_ptr<EventStream> stream;
  int backlogs = 0;

 private:
  int _client = -1;
};

TEST_F(EventStreamTest, sendsStraightAwayWhileThereIsRoom) {
  send(1);
  send(2);
  EXPECT_EQ(received(), (std::vector<std::int64_t>{1, 2}));
  EXPECT_EQ(backlogs, 0);
  EXPECT_EQ(stream->pollEvents(), POLLIN);
}

TEST_F(EventStreamTest, keepsEventsInOrderForAClientThatIsSlow) {
  constexpr std::int64_t kEvents = 600;
  for (std::int64_t i = 0; i < kEvents; ++i) send(i);
  EXPECT_EQ(backlogs, 1);
  EXPECT_EQ(stream->pollEvents(), POLLIN | POLLOUT);
  auto all = received();
  while (stream->pollEvents() != POLLIN) {
    stream->flush();
    const auto more = received();
    all.insert(all.end(), more.begin(), more.end());
  }
  ASSERT_EQ(all.size(), static_cast<std::size_t>(kEvents));
  for (std::int64_t i = 0; i < kEvents; ++i) EXPECT_EQ(all[static_cast<std::size_t>(i)], i);
  EXPECT_EQ(stream->dropped(), 0U);
}

TEST_F(EventStreamTest, dropsTheOldestAndCountsThemForAClientThatIsFrozen) {
  constexpr std::int64_t kEvents = 5000;
  for (std::int64_t i = 0; i < kEvents; ++i) send(i);
  auto all = received();
  while (stream->pollEvents() != POLLIN) {
    stream->flush();
    const auto more = received();
    all.insert(all.end(), more.begin(), more.end());
  }
  EXPECT_GT(stream->dropped(), 0U);
  EXPECT_EQ(all.size() + stream->dropped(), static_cast<std::size_t>(kEvents));
  EXPECT_EQ(all.back(), kEvents - 1);
  EXPECT_TRUE(std::is_sorted(all.begin(), all.end()));
  // What waited was the newest megabyte, without a gap.
  const auto waiting = EventStream::kLargestBacklog / 1200;
  EXPECT_EQ(all[all.size() - waiting], kEvents - static_cast<std::int64_t>(waiting));
}

TEST_F(EventStreamTest, noticesThatTheClientHasGone) {
  closeClient();
  send(1);
  EXPECT_TRUE(stream->isBroken());
  EXPECT_EQ(backlogs, 1);
  send(2);
  EXPECT_EQ(stream->dropped(), 0U);
}

}  // namespace
}  // namespace qel::service
