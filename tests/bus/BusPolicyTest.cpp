// The shipped bus policy, on a bus like the system's, tried as different users. Needs root, who
// alone can become somebody else.

#include <grp.h>
#include <gtest/gtest.h>
#include <pwd.h>
#include <sdbus-c++/sdbus-c++.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <regex>
#include <sstream>
#include <thread>

#include "bus/ServiceProcess.h"
#include "tesk/bus/BasebandManager1Proxy.h"

namespace qel::testing {
namespace {

// Accounts that every Debian has, in place of those that installing the package makes.
constexpr const char* kServiceUser = "daemon";
constexpr const char* kClientGroup = "dialout";

std::string shippedPolicy() {
  std::ostringstream content;
  content << std::ifstream(QEL_BUS_POLICY).rdbuf();
  std::string policy = content.str();
  const auto start = policy.find("<busconfig>") + std::string("<busconfig>").size();
  policy = policy.substr(start, policy.find("</busconfig>") - start);
  policy = std::regex_replace(policy, std::regex("user=\"basebandd\""),
                              std::string("user=\"") + kServiceUser + "\"");
  return std::regex_replace(policy, std::regex("group=\"baseband\""),
                            std::string("group=\"") + kClientGroup + "\"");
}

// As the system bus: who may connect may do so, and all else is denied unless allowed.
std::string systemLikePolicy() {
  return "<policy context=\"default\"><allow user=\"*\"/><deny own=\"*\"/>"
         "<deny send_type=\"method_call\"/><allow send_type=\"signal\"/>"
         "<allow send_requested_reply=\"true\" send_type=\"method_return\"/>"
         "<allow send_requested_reply=\"true\" send_type=\"error\"/>"
         "<allow receive_type=\"method_call\"/><allow receive_type=\"method_return\"/>"
         "<allow receive_type=\"error\"/><allow receive_type=\"signal\"/>"
         "<allow send_destination=\"org.freedesktop.DBus\"/></policy>" +
         shippedPolicy();
}

// Runs `work` in a child as that user and groups; what it returned.
template <class Work>
int as(const char* user, const char* extraGroup, Work work) {
  const passwd account = *::getpwnam(user);
  const gid_t extra = extraGroup ? ::getgrnam(extraGroup)->gr_gid : account.pw_gid;
  const pid_t child = ::fork();
  if (child == 0) {
    const bool changed = ::setgroups(1, &extra) == 0 && ::setgid(account.pw_gid) == 0 &&
                         ::setuid(account.pw_uid) == 0;
    ::_exit(changed ? work() : 99);
  }
  int status = 0;
  ::waitpid(child, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

enum Answer { allowed = 0, denied = 1, other = 2 };

int judge(const std::function<void()>& call) {
  try {
    call();
    return allowed;
  } catch (const sdbus::Error& error) {
    return error.getName() == "org.freedesktop.DBus.Error.AccessDenied" ? denied : other;
  }
}

class BusPolicy : public ::testing::Test {
 protected:
  void SetUp() override {
    if (::geteuid() != 0) GTEST_SKIP() << "needs root";
    bus = std::make_unique<PrivateBus>(systemLikePolicy());
    service = std::make_unique<ServiceProcess>(*bus, "simulated");
    ASSERT_TRUE(Client(*bus, "root").waitForReachable(true));
  }

  int callAs(const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        const auto proxy =
            sdbus::createProxy(*connection, tesk::bus::kServiceName, tesk::bus::kObjectPath);
        sdbus::UnixFd events;
        proxy->callMethod("Register")
            .onInterface(tesk::bus::kServiceName)
            .withArguments("somebody")
            .storeResultsTo(events);
      });
    });
  }

  int readPropertyAs(const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        const auto proxy =
            sdbus::createProxy(*connection, tesk::bus::kServiceName, tesk::bus::kObjectPath);
        const std::string source =
            proxy->getProperty("Source").onInterface(tesk::bus::kServiceName);
        if (source.empty()) throw sdbus::Error("empty");
      });
    });
  }

  std::unique_ptr<PrivateBus> bus;
  std::unique_ptr<ServiceProcess> service;
};

TEST_F(BusPolicy, refusesEveryCallOfAUserOutsideTheGroup) {
  EXPECT_EQ(callAs("nobody", nullptr), denied);
  EXPECT_EQ(readPropertyAs("nobody", nullptr), denied);
}

TEST_F(BusPolicy, letsTheGroupIn) {
  EXPECT_EQ(callAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(readPropertyAs("nobody", kClientGroup), allowed);
}

TEST_F(BusPolicy, givesTheNameToTheServiceUserOnly) {
  const auto ownAs = [this](const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        connection->requestName(tesk::bus::kServiceName);
      });
    });
  };
  service.reset();
  EXPECT_NE(ownAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(ownAs(kServiceUser, nullptr), allowed);
}

TEST_F(BusPolicy, hidesSignalsFromUsersOutsideTheGroup) {
  // A stranger who listens for any signal of the service sees none while clients come and go.
  const auto heardAs = [this](const char* user, const char* group) {
    std::array<int, 2> ready{};
    EXPECT_EQ(::pipe(ready.data()), 0);
    std::thread disturbance([&] {
      char go = 0;
      if (::read(ready[0], &go, 1) == 1) {
        for (int i = 0; i < 20; ++i) Client(*bus, "visitor").waitForReachable(true);
      }
    });
    const int heard = as(user, group, [this, &ready] {
      const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
      bool signal = false;
      const auto match =
          connection->addMatch("type='signal',interface='org.freedesktop.DBus.Properties'",
                               [&signal](sdbus::Message&) { signal = true; });
      if (::write(ready[1], "x", 1) != 1) return int{other};
      const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(2);
      while (!signal && std::chrono::steady_clock::now() < end) {
        while (connection->processPendingRequest()) {
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
      }
      return signal ? 10 : 11;
    });
    ::close(ready[1]);
    disturbance.join();
    ::close(ready[0]);
    return heard;
  };
  EXPECT_EQ(heardAs("nobody", kClientGroup), 10);
  EXPECT_EQ(heardAs("nobody", nullptr), 11);
}

}  // namespace
}  // namespace qel::testing
