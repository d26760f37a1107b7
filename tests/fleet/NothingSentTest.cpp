// The viewer and the service alone send nothing anywhere: they have no way out of the machine.
#include "fleet/WithBroker.h"

namespace qel::testing {
namespace {

class NothingSent : public WithBroker {
 protected:
  // What kinds of sockets the program made, as strace writes them down.
  std::string socketsOf(std::vector<std::string> words) const {
    const std::string trace = file("trace");
    words.insert(words.begin(), {"-f", "-qq", "-e", "trace=socket", "-o", trace});
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("HOME", directory.c_str(), 1);
    const Outcome outcome = run("/usr/bin/strace", words);
    EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
    std::ifstream stream(trace);
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
  }

  static bool isTraceable() {
    return run("/usr/bin/strace", {"-o", "/dev/null", "/bin/true"}).exitCode == 0;
  }
};

TEST_F(NothingSent, byViewerAndService) {
  if (!isTraceable()) GTEST_SKIP() << "this machine lets nobody trace";
  const auto withInternet = [](const std::string& sockets) {
    return sockets.find("AF_INET") != std::string::npos;
  };
  const std::string viewer = socketsOf({QEL_QELWATCH, "--bus", bus.address(), "--self-test"});
  EXPECT_NE(viewer.find("AF_UNIX"), std::string::npos) << viewer;
  EXPECT_FALSE(withInternet(viewer)) << viewer;
  const std::string recorder =
      socketsOf({QEL_QELCTL, "record", file("a.jsonl"), "--bus", bus.address(), "--duration", "1"});
  EXPECT_FALSE(withInternet(recorder)) << recorder;
  const PrivateBus other;
  const std::string own =
      socketsOf({"/usr/bin/timeout", "--preserve-status", "2", QEL_BASEBANDD, "--bus",
                 other.address(), "--no-state", "--source", "simulated"});
  EXPECT_NE(own.find("AF_UNIX"), std::string::npos) << own;
  EXPECT_FALSE(withInternet(own)) << own;
  const Broker broker(directory);
  auto publish = publishing(broker.url(), {"--duration", "1"});
  publish.insert(publish.begin(), QEL_QELCTL);
  EXPECT_TRUE(withInternet(socketsOf(publish)));
}

}  // namespace
}  // namespace qel::testing
