#include "sources/diagnostics/session/DiagnosticsSession.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <deque>

#include "support/diagnostics/ModemBrain.h"
#include "support/diagnostics/PacketLog.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using namespace std::chrono_literals;
using State = DiagnosticsSession::State;
using test::ModemBrain;
using test::PacketLog;
using ::testing::IsEmpty;
using ::testing::SizeIs;

// The modem's answers are there as soon as the request is said.
class PlayedPort final : public DiagPort {
 public:
  int descriptor() const override { return -1; }
  bool receive(const FrameReader::Take& take) override {
    while (!waiting.empty()) {
      const Bytes packet = waiting.front();
      waiting.pop_front();
      take(packet);
    }
    return !lost;
  }
  bool send(const Request& request) override {
    said.emplace_back(request.name());
    for (const Bytes& answer : brain.answersTo(request.packet())) waiting.push_back(answer);
    return true;
  }
  const FrameReader::Counts& counts() const override { return _counts; }
  bool isShared() const override { return shared; }

  ModemBrain brain;
  std::deque<Bytes> waiting;
  std::vector<std::string> said;
  bool lost = false;
  bool shared = false;

 private:
  FrameReader::Counts _counts;
};

WantedPackets someWanted() {
  return {[](std::uint16_t code) { return code == 0xB0C0 || code == 0xB193 || code == 0x1098; },
          [](std::uint16_t id) { return id == 1606; }};
}

class DiagnosticsSessionTest : public testing::Test {
 protected:
  DiagnosticsSession& begin() {
    return session.emplace(port, log, someWanted(), SessionTiming(), now);
  }
  void turn() {
    session->receive(now);
    session->step(now);
  }
  // As the source does, until nothing is due within that time.
  void passTime(std::chrono::milliseconds time) {
    const auto end = now + time;
    turn();
    while (!session->isOver() && (!port.waiting.empty() || session->due() <= end)) {
      if (port.waiting.empty()) now = std::max(now, session->due());
      turn();
    }
    now = end;
  }
  void beginAndListen() {
    begin();
    passTime(500ms);
    ASSERT_EQ(session->state(), State::listening);
    port.said.clear();
  }
  void sendLog(std::uint16_t code) { port.waiting.push_back(test::logPacket(code, Bytes{1})); }

  PlayedPort port;
  PacketLog log;
  DiagnosticsSession::Clock::time_point now{1h};
  std::optional<DiagnosticsSession> session;
};

TEST_F(DiagnosticsSessionTest, SwitchesAllOffThenAsksThenSwitchesOnWhatIsWanted) {
  begin();
  passTime(500ms);
  EXPECT_EQ(session->state(), State::listening);
  EXPECT_THAT(port.said, ::testing::ElementsAre("events off", "messages off", "logs off", "build",
                                                "version", "log ranges", "log mask", "log mask",
                                                "event mask", "events on"));
  EXPECT_TRUE(port.brain.sends(0xB0C0));
  EXPECT_TRUE(port.brain.sends(0x1098));
  EXPECT_FALSE(port.brain.sends(0xB0C1));
  EXPECT_TRUE(port.brain.sendsEvents());
  EXPECT_THAT(port.brain.forbidden(), IsEmpty());
  ASSERT_TRUE(session->build());
  EXPECT_EQ(session->build()->model, "Pseudo modem");
  ASSERT_TRUE(session->version());
}

TEST_F(DiagnosticsSessionTest, AsksForNoCodeBeyondTheModemsRange) {
  port.brain.ranges[11] = 0x193;  // 0xB193 is the first that is not there
  begin();
  passTime(500ms);
  EXPECT_TRUE(port.brain.sends(0xB0C0));
  EXPECT_FALSE(port.brain.sends(0xB193));
}

TEST_F(DiagnosticsSessionTest, HandsOverLogsThatWereAskedForAlone) {
  beginAndListen();
  sendLog(0xB0C0);
  sendLog(0xB0F2);
  sendLog(0x4127);
  turn();
  ASSERT_THAT(log.logs, SizeIs(1));
  EXPECT_EQ(log.logs[0].code, 0xB0C0);
  EXPECT_EQ(session->unwantedPackets(), 2U);
}

TEST_F(DiagnosticsSessionTest, HandsOverEventsThatWereAskedForAlone) {
  beginAndListen();
  port.waiting.push_back(test::eventPacket({{1606, {4}}, {1607, {}}}));
  turn();
  ASSERT_THAT(log.events, SizeIs(1));
  EXPECT_EQ(log.events[0].id, 1606);
}

TEST_F(DiagnosticsSessionTest, DropsWhatAnEarlierProgramHadAskedFor) {
  begin();
  sendLog(0xB0C0);
  turn();
  EXPECT_THAT(log.logs, IsEmpty());
}

TEST_F(DiagnosticsSessionTest, AsksOnceMoreAfterTwoSecondsAndThenGivesUp) {
  port.brain.manner = ModemBrain::Manner::silent;
  begin();
  passTime(1999ms);
  EXPECT_THAT(port.said, SizeIs(1));
  passTime(1ms);
  EXPECT_THAT(port.said, SizeIs(2));
  passTime(1999ms);
  EXPECT_EQ(session->state(), State::starting);
  passTime(1ms);
  EXPECT_EQ(session->state(), State::silent);
  EXPECT_TRUE(session->isOver());
}

TEST_F(DiagnosticsSessionTest, TakesAnAnswerToTheSecondAsking) {
  port.brain.manner = ModemBrain::Manner::silent;
  begin();
  passTime(1s);
  port.brain.manner = ModemBrain::Manner::honest;
  passTime(3s);
  EXPECT_EQ(session->state(), State::listening);
}

TEST_F(DiagnosticsSessionTest, FindsAnswersAmongLogs) {
  begin();
  for (int i = 0; i < 20; ++i) {
    sendLog(0xB0F0);
    port.waiting.push_back(Bytes{0x79, 1, 2, 3});
    passTime(100ms);
  }
  EXPECT_EQ(session->state(), State::listening);
}

TEST_F(DiagnosticsSessionTest, SaysThatAModemRefuses) {
  port.brain.manner = ModemBrain::Manner::refusing;
  begin();
  passTime(1s);
  EXPECT_EQ(session->state(), State::refused);
}

TEST_F(DiagnosticsSessionTest, TrustsNoAnswerOfALiar) {
  port.brain.manner = ModemBrain::Manner::lying;
  begin();
  passTime(60s);
  EXPECT_EQ(session->state(), State::silent);
  EXPECT_THAT(port.brain.forbidden(), IsEmpty());
}

TEST_F(DiagnosticsSessionTest, DoesWithoutTheEventsOfAModemThatHasNone) {
  port.brain.manner = ModemBrain::Manner::withoutEvents;
  begin();
  passTime(500ms);
  EXPECT_EQ(session->state(), State::listening);
}

TEST_F(DiagnosticsSessionTest, RefusesAModemThatHasNoneOfTheLogs) {
  port.brain.ranges = {};
  begin();
  passTime(500ms);
  EXPECT_EQ(session->state(), State::refused);
}

TEST_F(DiagnosticsSessionTest, ReadsTheMasksBackOnASharedPort) {
  port.shared = true;
  beginAndListen();
  passTime(29s);
  EXPECT_THAT(port.said, IsEmpty());
  port.brain.setMask(11, Bytes(65));  // another client's
  passTime(1s);
  EXPECT_TRUE(port.brain.sends(0xB0C0));
  EXPECT_EQ(session->replacedMasks(), 1U);
  EXPECT_EQ(session->state(), State::listening);
  port.said.clear();
  passTime(30s);
  EXPECT_THAT(port.said, ::testing::Not(IsEmpty()));
  EXPECT_EQ(session->replacedMasks(), 1U);
}

TEST_F(DiagnosticsSessionTest, AsksAQuietModemWhetherItIsThereAndHasItsMasks) {
  beginAndListen();
  passTime(50s);
  sendLog(0xB0C0);
  passTime(50s);
  EXPECT_THAT(port.said, IsEmpty());
  port.brain.forget();
  passTime(20s);
  EXPECT_TRUE(port.brain.sends(0xB0C0));
  port.brain.manner = ModemBrain::Manner::silent;
  passTime(70s);
  EXPECT_EQ(session->state(), State::silent);
}

TEST_F(DiagnosticsSessionTest, LooksAtOnceWhenAsked) {
  beginAndListen();
  port.brain.forget();
  session->check(now);
  passTime(10ms);
  EXPECT_TRUE(port.brain.sends(0xB0C0));
}

TEST_F(DiagnosticsSessionTest, SwitchesLogsOffWhileNobodyListens) {
  beginAndListen();
  session->listen(false, now);
  passTime(10ms);
  EXPECT_EQ(session->state(), State::resting);
  EXPECT_FALSE(port.brain.sendsAnyLog());
  EXPECT_FALSE(port.brain.sendsEvents());
  EXPECT_EQ(session->due(), DiagnosticsSession::Clock::time_point::max());
  sendLog(0xB0C0);
  turn();
  EXPECT_THAT(log.logs, IsEmpty());
  session->listen(true, now);
  passTime(10ms);
  EXPECT_EQ(session->state(), State::listening);
  EXPECT_TRUE(port.brain.sends(0xB0C0));
  EXPECT_TRUE(port.brain.sendsEvents());
}

TEST_F(DiagnosticsSessionTest, NoticesWhileItStartsThatNobodyListens) {
  begin();
  session->listen(false, now);
  passTime(1s);
  EXPECT_EQ(session->state(), State::resting);
  EXPECT_FALSE(port.brain.sendsAnyLog());
}

TEST_F(DiagnosticsSessionTest, SwitchesAllOffAtTheEndFromEveryState) {
  for (const auto after : {0ms, 100ms, 500ms, 40000ms}) {
    port = {};
    begin();
    passTime(after);
    session->end(now);
    passTime(10ms);
    EXPECT_EQ(session->state(), State::ended) << after.count();
    EXPECT_FALSE(port.brain.sendsAnyLog());
    EXPECT_FALSE(port.brain.sendsEvents());
    EXPECT_EQ(port.said.back(), "events off");
  }
}

TEST_F(DiagnosticsSessionTest, IsOverWhenThePortIsLost) {
  beginAndListen();
  port.lost = true;
  turn();
  EXPECT_EQ(session->state(), State::lost);
  session->end(now);
  EXPECT_EQ(session->state(), State::lost);
}

}  // namespace
}  // namespace qel::diagnostics
