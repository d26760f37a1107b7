// What of a phone's identity reaches the system log, by each way that the README names of starting
// a viewer. Every payload did, whichever way.

#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>

#include "sources/simulated/Bcd.h"
#include "sources/simulated/Identities.h"
#include "support/ChildProcess.h"
#include "tools/WithService.h"

namespace qel::testing {
namespace {

using Words = std::vector<std::string>;

std::string contentOf(const std::string& path) {
  std::ifstream stream(path, std::ios::binary);
  std::ostringstream content;
  content << stream.rdbuf();
  return content.str();
}

// The words by which the viewer's icon starts it.
Words wordsOfTheIcon() {
  std::istringstream entry(contentOf(QEL_DESKTOP_ENTRY));
  for (std::string line; std::getline(entry, line);) {
    if (!line.starts_with("Exec=")) continue;
    std::istringstream call(line.substr(5));
    return {std::istream_iterator<std::string>(call), std::istream_iterator<std::string>()};
  }
  return {};
}

class SystemLog : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  // All of it, of a program that has shown who the phone is.
  std::string of(const Words& words) const {
    const std::string out = file("out");
    const std::string log = file("log");
    for (const std::string& name : {out, log}) std::filesystem::remove(name);
    ChildProcess program(
        {.words = words,
         .environment = {"LD_PRELOAD=" QEL_SYSLOG_TO_FILE, "QEL_SYSLOG_FILE=" + log,
                         "ASAN_OPTIONS=verify_asan_link_order=0:detect_leaks=0",
                         "QT_QPA_PLATFORM=offscreen", "XDG_CONFIG_HOME=" + directory,
                         "XDG_RUNTIME_DIR=" + directory},
         .out = out});
    const auto has = [&](const char* text) {
      return contentOf(out).find(text) != std::string::npos;
    };
    EXPECT_TRUE(eventually([&] {
      return has("Received MM Common Info Dict is") && has("Received SIM Card File Info is");
    })) << words.front();
    program.signal(SIGTERM);
    EXPECT_EQ(program.waitForEnd(), 0);
    EXPECT_NE(contentOf(out).find(imsi), std::string::npos) << "standard output is not the log";
    return contentOf(log);
  }

  std::string ofViewer(Words more) const {
    more.insert(more.begin(), QEL_QELWATCH);
    more.insert(more.end(), {"--bus", bus.address()});
    return of(more);
  }

  std::string ofLive(Words more) const {
    more.insert(more.begin(), {QEL_QELCTL, "live", "--bus", bus.address()});
    return of(more);
  }

  void expectNobodyIn(const std::string& log) const {
    for (const std::string& secret : {imsi, subscriber, card}) {
      EXPECT_EQ(log.find(secret), std::string::npos) << secret;
    }
  }

  const std::string imsi = hexText(sources::encodedImsi(sources::kImsi));
  const std::string subscriber = imsi.substr(8);  // beyond country and network
  const std::string card = hexText(sources::swappedDigits(sources::kIccid));
};

TEST_F(SystemLog, hasEveryEventInFullOfAViewerThatIsStartedBare) {
  const std::string log = ofViewer({});
  EXPECT_NE(log.find("-[TeskWrapper listen]_block_invoke: MetricsTrigger dict={"),
            std::string::npos);
  EXPECT_NE(log.find(imsi), std::string::npos);
  EXPECT_NE(log.find(card), std::string::npos);
}

TEST_F(SystemLog, hasNoEventOfAViewerThatIsStartedByItsIcon) {
  Words words = wordsOfTheIcon();
  ASSERT_EQ(words.at(0), "qelwatch");
  words.erase(words.begin());
  const std::string log = ofViewer(words);
  EXPECT_NE(log.find("-[TeskWrapper listen]: listening for events"), std::string::npos) << log;
  EXPECT_EQ(log.find("dict="), std::string::npos) << log;
  expectNobodyIn(log);
}

TEST_F(SystemLog, hasNobodysIdentityOfAViewerThatIsToldToHideIt) {
  const std::string log = ofViewer({"--event-log", "hidden"});
  EXPECT_NE(log.find("MetricsTrigger dict={"), std::string::npos);
  EXPECT_NE(log.find("\"kKeyPayload\": \"<"), std::string::npos);
  expectNobodyIn(log);
}

TEST_F(SystemLog, hasNothingOfQelctlLive) { EXPECT_EQ(ofLive({}), ""); }

TEST_F(SystemLog, hasTheEventsOfQelctlLiveWhenItIsToldTo) {
  const std::string full = ofLive({"--event-log", "full"});
  EXPECT_NE(full.find(imsi), std::string::npos);
  const std::string hidden = ofLive({"--event-log", "hidden"});
  EXPECT_NE(hidden.find("MetricsTrigger dict={"), std::string::npos);
  expectNobodyIn(hidden);
}

}  // namespace
}  // namespace qel::testing
