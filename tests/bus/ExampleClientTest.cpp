// The example client of the documentation works.

#include <gtest/gtest.h>

#include "bus/ServiceProcess.h"
#include "support/Subprocess.h"

namespace qel::testing {
namespace {

TEST(ExampleClient, printsTheMetricsThatItAskedFor) {
  const PrivateBus bus;
  const ServiceProcess service(bus, "simulated,speed=20");
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  const Outcome outcome = run(QEL_EXAMPLE_CLIENT, {bus.address(), QEL_CONFIGURATION, "30"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  EXPECT_NE(outcome.out.find("metric 3952490\n"), std::string::npos) << outcome.out;
}

TEST(ExampleClient, saysWhyItsConfigurationWasRefused) {
  const PrivateBus bus;
  const ServiceProcess service(bus, "simulated");
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  const Outcome outcome = run(QEL_EXAMPLE_CLIENT, {bus.address(), "/dev/null", "1"});
  EXPECT_EQ(outcome.exitCode, 1);
  EXPECT_NE(outcome.err.find("kKeyPayload"), std::string::npos) << outcome.err;
}

}  // namespace
}  // namespace qel::testing
