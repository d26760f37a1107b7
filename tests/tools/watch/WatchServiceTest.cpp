// qelctl watch at a service that goes and comes.

#include <csignal>

#include "tools/WithService.h"
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

}  // namespace
}  // namespace qel::testing
