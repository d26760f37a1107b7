// What publish does while nothing comes: nothing.
#include <chrono>
#include <thread>

#include "fleet/WithBroker.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

// Of all its threads.
std::uint64_t wakeUps(pid_t process) {
  std::uint64_t sum = 0;
  const std::string tasks = "/proc/" + std::to_string(process) + "/task";
  for (const auto& task : std::filesystem::directory_iterator(tasks)) {
    std::ifstream status(task.path() / "status");
    for (std::string word; status >> word;) {
      if (word != "voluntary_ctxt_switches:") continue;
      std::uint64_t count = 0;
      status >> count;
      sum += count;
    }
  }
  return sum;
}

bool sleeps(pid_t process) {
  const std::uint64_t before = wakeUps(process);
  std::this_thread::sleep_for(3s);
  return before > 0 && wakeUps(process) == before;
}

class PublishAtRest : public WithBroker {
 protected:
  // As many lines of the broker's log as have the text.
  std::size_t logged(const std::string& text) const {
    std::ifstream log(file("broker.log"));
    std::size_t count = 0;
    for (std::string line; std::getline(log, line);) count += line.find(text) != std::string::npos;
    return count;
  }

  ChildProcess publisher(const PrivateBus& from, const std::string& phone) const {
    return ChildProcess({.words = {QEL_QELCTL, "publish", broker.url(), "--bus", from.address(),
                                   "--state", file(phone), "--phone", phone, "--every", "50ms"},
                         .err = file(phone + ".said")});
  }

  Broker broker{directory};
  Subscriber subscriber{broker, file("received")};
};

TEST_F(PublishAtRest, sleepsOverOneConnection) {
  ASSERT_EQ(ask({"record", file("few.jsonl"), "--duration", "0.5"}).exitCode, 0);
  const PrivateBus quiet;
  const ServiceProcess once(quiet, "recording:" + file("few.jsonl"));
  ASSERT_TRUE(Client(quiet, "first").waitForReachable(true));
  ChildProcess rested = publisher(quiet, "one");
  ASSERT_TRUE(eventually([&] { return subscriber.newest() > 5; }));
  EXPECT_TRUE(eventually([&] { return sleeps(rested.pid()); }));
  rested.signal(SIGTERM);
  EXPECT_EQ(rested.waitForEnd(), 0);
  EXPECT_EQ(logged(" as qelwatch-one "), 1U);
}

// So that the test above could fail.
TEST_F(PublishAtRest, endsWithTheFirstEvent) {
  const ChildProcess busy = publisher(bus, "one");
  ASSERT_TRUE(eventually([&] { return subscriber.newest() > 5; }));
  EXPECT_FALSE(sleeps(busy.pid()));
}

}  // namespace
}  // namespace qel::testing
