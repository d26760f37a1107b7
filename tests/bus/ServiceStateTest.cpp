// What the service keeps from one run to the next, and where.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>

#include "bus/ServiceProcess.h"
#include "support/Subprocess.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;
using State = ServiceProcess::State;

constexpr std::uint32_t kRrcState = 19972;

class ServiceState : public ::testing::Test {
 protected:
  ServiceState() {
    std::string pattern = (fs::temp_directory_path() / "qelstate-XXXXXX").string();
    home = ::mkdtemp(pattern.data());
    for (const char* variable : {"STATE_DIRECTORY", "XDG_STATE_HOME"}) ::unsetenv(variable);
    ::setenv("HOME", home.c_str(), 1);
  }
  ~ServiceState() override { fs::remove_all(home); }

  // Whether a configuration outlives the service.
  bool outlives(ServiceProcess& service) const {
    {
      Client client(bus, "tester");
      EXPECT_TRUE(client.waitForReachable(true));
      EXPECT_EQ(client.install(7, {kRrcState}).code, 0);
    }
    service.signal(SIGTERM);
    EXPECT_EQ(service.waitForEnd(), 0);
    service.start();
    EXPECT_TRUE(Client(bus, "other").waitForReachable(true));
    std::string why;
    const auto status = tesk::bus::readServiceStatus({bus.address()}, why);
    EXPECT_TRUE(status) << why;
    const bool configured = status && status->configurations.contains(7);
    service.signal(SIGTERM);
    service.waitForEnd();
    return configured;
  }

  std::string home;
  PrivateBus bus;
};

TEST_F(ServiceState, isKeptByDefaultBelowTheHomeOfItsUserForThatUserOnly) {
  ServiceProcess service(bus, "simulated,speed=20", State::whereTheEnvironmentSays);
  EXPECT_TRUE(outlives(service));
  for (const char* made : {"/.local", "/.local/state", "/.local/state/basebandd"}) {
    EXPECT_EQ(fs::status(home + made).permissions(), fs::perms::owner_all) << made;
  }
  EXPECT_TRUE(fs::is_regular_file(home + "/.local/state/basebandd/state"));
}

TEST_F(ServiceState, isKeptWhereTheEnvironmentSays) {
  ::setenv("XDG_STATE_HOME", (home + "/states").c_str(), 1);
  {
    ServiceProcess service(bus, "simulated,speed=20", State::whereTheEnvironmentSays);
    EXPECT_TRUE(outlives(service));
  }
  EXPECT_TRUE(fs::exists(home + "/states/basebandd/state"));
  ::setenv("STATE_DIRECTORY", (home + "/given:/other").c_str(), 1);
  {
    ServiceProcess service(bus, "simulated,speed=20", State::whereTheEnvironmentSays);
    EXPECT_TRUE(outlives(service));
  }
  EXPECT_TRUE(fs::exists(home + "/given/state"));
  EXPECT_FALSE(fs::exists(home + "/.local"));
}

TEST_F(ServiceState, isForgottenWhenItIsToldTo) {
  ServiceProcess service(bus, "simulated,speed=20", State::none);
  EXPECT_FALSE(outlives(service));
  EXPECT_TRUE(fs::is_empty(home));
}

// It hung before it was on the bus.
TEST_F(ServiceState, thatIsAFifoHoldsNothingUp) {
  ASSERT_EQ(::mkfifo((home + "/state").c_str(), 0600), 0);
  ServiceProcess service(bus, "simulated,speed=20", home);
  EXPECT_TRUE(outlives(service)) << "it is replaced with the first configuration";
}

TEST_F(ServiceState, thatHasNoPlaceIsOneLineAndTheServiceGoesOn) {
  ::setenv("XDG_STATE_HOME", "/proc/nowhere", 1);
  const std::string said = home + "/said";
  const Outcome outcome =
      run("/bin/sh", {"-c", QEL_BASEBANDD " -v --source simulated --bus '" + bus.address() +
                                "' 2>" + said + " & until grep -qs 'on the bus' " + said +
                                "; do sleep 0.05; done; kill $!; wait $!; code=$?; cat " + said +
                                " >&2; exit $code"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(outcome.err,
            "basebandd: configurations are forgotten at its end: /proc/nowhere/basebandd: No such "
            "file or directory\n"
            "basebandd: on the bus as tesk.BasebandManager1\n");
}

TEST_F(ServiceState, cannotBeKeptAndForgotten) {
  const Outcome outcome = run(QEL_BASEBANDD, {"--no-state", "--state", home});
  EXPECT_EQ(outcome.exitCode, 64);
  EXPECT_EQ(outcome.err.rfind("basebandd: usage: ", 0), 0U) << outcome.err;
}

}  // namespace
}  // namespace qel::testing
