// Shipped bus policies, tried as different users. Root alone can become somebody else.
#pragma once

#include <grp.h>
#include <pwd.h>
#include <sdbus-c++/sdbus-c++.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <functional>
#include <regex>
#include <sstream>
#include <string>

namespace qel::testing {

// Accounts that every Debian has, in place of those that installing the package makes.
inline constexpr const char* kServiceUser = "daemon";
inline constexpr const char* kClientGroup = "dialout";

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

inline int judge(const std::function<void()>& call) {
  try {
    call();
    return allowed;
  } catch (const sdbus::Error& error) {
    return error.getName() == "org.freedesktop.DBus.Error.AccessDenied" ? denied : other;
  }
}

}  // namespace qel::testing
