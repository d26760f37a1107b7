// The viewer and the service alone send nothing anywhere: they have no way out of the machine.
#include "fleet/WithBroker.h"

namespace qel::testing {
namespace {

// A program under strace, which writes down what kinds of sockets it makes.
class Traced {
 public:
  Traced(const std::string& trace, std::vector<std::string> words)
      : _trace(trace),
        _process({.words = traced(_trace, std::move(words)),
                  // A leak checker does not work under a tracer.
                  .environment = {"ASAN_OPTIONS=detect_leaks=0"},
                  .out = trace + ".out"}) {}

  ChildProcess& process() { return _process; }
  // Once it has ended.
  std::string sockets() const {
    const auto read = [this] {
      std::ifstream stream(_trace);
      return std::string(std::istreambuf_iterator<char>(stream), {});
    };
    EXPECT_TRUE(eventually([&] { return read().find("+++ exited") != std::string::npos; }));
    return read();
  }

 private:
  // With the tracer aside, so that signals reach the program.
  static std::vector<std::string> traced(const std::string& trace, std::vector<std::string> words) {
    words.insert(words.begin(), {"/usr/bin/strace", "-D", "-f", "-e", "trace=socket", "-o", trace});
    return words;
  }

  const std::string _trace;
  ChildProcess _process;
};

bool reachesTheInternet(const std::string& sockets) {
  return sockets.find("AF_INET") != std::string::npos;
}

class NothingSent : public WithBroker {
 protected:
  void SetUp() override {
    if (run("/usr/bin/strace", {"-o", "/dev/null", "/bin/true"}).exitCode != 0) {
      GTEST_SKIP() << "this machine lets nobody trace";
    }
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("HOME", directory.c_str(), 1);
    WithBroker::SetUp();
  }

  std::string socketsOf(std::vector<std::string> words) const {
    Traced program(file("trace"), std::move(words));
    EXPECT_EQ(program.process().waitForEnd(), 0);
    return program.sockets();
  }
};

TEST_F(NothingSent, byTheViewer) {
  const std::string viewer = socketsOf({QEL_QELWATCH, "--bus", bus.address(), "--self-test"});
  EXPECT_NE(viewer.find("AF_UNIX"), std::string::npos) << viewer;
  EXPECT_FALSE(reachesTheInternet(viewer)) << viewer;
}

TEST_F(NothingSent, byTheViewerWithTheServiceWithin) {
  const std::string viewer = socketsOf({QEL_QELWATCH, "--source", "simulated", "--self-test"});
  EXPECT_NE(viewer.find("exited"), std::string::npos);
  EXPECT_FALSE(reachesTheInternet(viewer)) << viewer;
}

TEST_F(NothingSent, byTheServiceWhileItServes) {
  const PrivateBus other;
  Traced own(file("trace"), {QEL_BASEBANDD, "--bus", other.address(), "--no-state", "--source",
                             "simulated,speed=20"});
  ASSERT_TRUE(Client(other, "first").waitForReachable(true));
  const Outcome recorded =
      qelctl({"record", file("a.jsonl"), "--bus", other.address(), "--duration", "1"});
  EXPECT_EQ(recorded.exitCode, 0) << recorded.err;
  own.process().signal(SIGTERM);
  EXPECT_EQ(own.process().waitForEnd(), 0);
  EXPECT_NE(own.sockets().find("AF_UNIX"), std::string::npos);
  EXPECT_FALSE(reachesTheInternet(own.sockets())) << own.sockets();
}

TEST_F(NothingSent, byWhoRecords) {
  const std::string recorder =
      socketsOf({QEL_QELCTL, "record", file("a.jsonl"), "--bus", bus.address(), "--duration", "1"});
  EXPECT_NE(recorder.find("AF_UNIX"), std::string::npos) << recorder;
  EXPECT_FALSE(reachesTheInternet(recorder)) << recorder;
}

// And it would be seen.
TEST_F(NothingSent, butByWhoPublishes) {
  const Broker broker(directory);
  auto publish = publishing(broker.url(), {"--duration", "1"});
  publish.insert(publish.begin(), QEL_QELCTL);
  EXPECT_TRUE(reachesTheInternet(socketsOf(publish)));
}

}  // namespace
}  // namespace qel::testing
