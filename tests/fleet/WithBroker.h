// qelctl publish between the service and a broker.
#pragma once

#include <algorithm>
#include <csignal>
#include <fstream>
#include <iterator>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "fleet/Broker.h"
#include "tools/WithService.h"

namespace qel::testing {

class WithBroker : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  // The words of publish to that URL as the phone "one", with a queue in the test's directory.
  std::vector<std::string> publishing(const std::string& url,
                                      std::vector<std::string> more = {}) const {
    std::vector<std::string> arguments = {"publish", url,    "--phone", "one",
                                          "--every", "50ms", "--state", file("state")};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return words(std::move(arguments));
  }

  // Ends it in order. What it said.
  static std::string end(RunningQelctl& publisher) {
    publisher.signal(SIGTERM);
    EXPECT_EQ(publisher.waitForEnd(), 0) << publisher.err();
    return publisher.err();
  }

  // By what it said at its end.
  static std::uint64_t sentBy(const std::string& said) {
    const auto end = said.find(" events sent");
    const auto begin = said.rfind(' ', end - 1) + 1;
    return end == std::string::npos ? 0 : std::stoull(said.substr(begin, end - begin));
  }

  using Events = std::map<std::uint64_t, std::string>;
  static bool isWithoutGap(const Events& events) {
    return !events.empty() && events.begin()->first == 1 && events.rbegin()->first == events.size();
  }

  std::string write(const std::string& name, const std::string& content,
                    std::filesystem::perms rights = std::filesystem::perms(0600)) const {
    std::ofstream(file(name)) << content;
    std::filesystem::permissions(file(name), rights);
    return file(name);
  }
};

}  // namespace qel::testing
