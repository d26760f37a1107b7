// Shipped bus policies, tried as different users. Root alone can become somebody else.
#pragma once

#include <fstream>
#include <regex>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "bus/Answer.h"
#include "support/ChildProcess.h"
#include "support/PrivateBus.h"

namespace qel::testing {

// Accounts that every Debian has, in place of those that installing the package makes.
inline constexpr const char* kServiceUser = "daemon";
inline constexpr const char* kClientGroup = "dialout";
inline constexpr const char* kOtherGroup = "nogroup";

// What stands in that policy file, for these accounts.
inline std::string shippedPolicy(const char* file) {
  std::ostringstream content;
  content << std::ifstream(file).rdbuf();
  std::string policy = content.str();
  const auto start = policy.find("<busconfig>") + std::string("<busconfig>").size();
  policy = policy.substr(start, policy.find("</busconfig>") - start);
  policy = std::regex_replace(policy, std::regex("user=\"basebandd\""),
                              std::string("user=\"") + kServiceUser + "\"");
  return std::regex_replace(policy, std::regex("group=\"baseband\""),
                            std::string("group=\"") + kClientGroup + "\"");
}

// Does that as that user, who is in the group as well; `words` as BusUser.cpp has them.
inline Launch launchAs(const std::string& user, const std::string& group, const PrivateBus& bus,
                       const std::vector<std::string>& words) {
  std::vector<std::string> all = {QEL_BUS_USER, user, group, bus.address()};
  all.insert(all.end(), words.begin(), words.end());
  return {.words = std::move(all)};
}

inline int as(const std::string& user, const std::string& group, const PrivateBus& bus,
              const std::vector<std::string>& words) {
  return ChildProcess(launchAs(user, group, bus, words)).waitForEnd();
}

}  // namespace qel::testing
