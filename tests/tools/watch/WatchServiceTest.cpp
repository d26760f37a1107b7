// qelctl watch at a service that goes and comes.

#include <csignal>

#include "bus/MoodyService.h"
#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"
#include "tools/WithService.h"
#include "tools/watch/Pty.h"
#include "tools/watch/Tmux.h"

namespace qel::testing {
namespace {

class WatchAtService : public WithService {};

TEST_F(WatchAtService, tellsThatItIsLostAndGoesOnWhenItIsBack) {
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  const Tmux terminal(
      80, 24, "env LC_ALL=C.UTF-8 " QEL_QELCTL " watch --bus '" + bus.address() + "' 2>/dev/null");
  const auto becomes = [&](const char* text) {
    return eventually([&] { return terminal.shows(text); });
  };
  ASSERT_TRUE(becomes("Operator 001-01")) << terminal.screen();
  EXPECT_TRUE(becomes("Connected")) << terminal.screen();
  service.signal(SIGTERM);
  ASSERT_EQ(service.waitForEnd(), 0);
  ASSERT_TRUE(becomes("not running, lost at")) << terminal.screen();
  EXPECT_TRUE(terminal.shows("Operator 001-01")) << "values do not stay";
  terminal.press("h");
  EXPECT_TRUE(becomes("Service lost")) << terminal.screen();
  service.start();
  EXPECT_TRUE(becomes("Service found again")) << terminal.screen();
}

// What no service sends that keeps to the rules ends the viewer; its reader is left with a terminal
// that can be used, and with the reason.
TEST(WatchAtABrokenService, givesTheTerminalBackBeforeItEndsFatally) {
  using Mood = MoodyService::Mood;
  const PrivateBus bus;
  MoodyService service(bus, Mood::answers, Mood::answers);
  WatchAtPty watch({"--bus", bus.address()});
  const termios before = watch.settings();
  ASSERT_TRUE(watch.writes("Connected, no reports yet"));
  const auto packet = tesk::bus::encodeEvent(
      tesk::kEventMetric,
      tesk::Message(Dictionary{{"kKeyMetricID", 0x3C4E04}, {"kKeyPayload", Bytes{0xFF}}}));
  ASSERT_TRUE(packet);
  service.send(*packet);
  EXPECT_EQ(watch.waitForEnd(), -SIGABRT);
  EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before));
  ASSERT_TRUE(watch.writes("fatal error: metric 3C4E04 has an undecodable payload"));
  EXPECT_LT(watch.written().find("\x1B[?1049l"), watch.written().find("fatal error: "));
}

}  // namespace
}  // namespace qel::testing
