// Somebody else on a bus: becomes that user before anything else, and does one thing there.
//
//   bus_user USER GROUP ADDRESS call SERVICE PATH INTERFACE MEMBER [TEXT]
//                               property SERVICE PATH INTERFACE NAME
//                               own NAME
//                               listen MATCH    says "ready"; allowed once a signal came
//                               modem           reads ModemManager's modem until it is killed
//
// It exits with what came of it, an Answer. A program of its own, for a child that goes on with the
// memory of a test may wait forever for a thread that it has not got.

#include <grp.h>
#include <pwd.h>
#include <sdbus-c++/sdbus-c++.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "bus/Answer.h"
#include "sources/modem_manager/ModemManagerSource.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;
using Words = std::vector<std::string>;

bool become(const std::string& user, const std::string& group) {
  const passwd* account = ::getpwnam(user.c_str());
  const struct group* extra = ::getgrnam(group.c_str());
  return account && extra && ::setgroups(1, &extra->gr_gid) == 0 &&
         ::setgid(account->pw_gid) == 0 && ::setuid(account->pw_uid) == 0;
}

std::unique_ptr<sdbus::IConnection> connected(const std::string& address) {
  return sdbus::createSessionBusConnectionWithAddress(address);
}

void call(const std::string& address, const Words& words) {
  const auto connection = connected(address);
  const auto proxy = sdbus::createProxy(*connection, words.at(0), words.at(1));
  auto method = proxy->createMethodCall(words.at(2), words.at(3));
  if (words.size() > 4) method << words.at(4);
  proxy->callMethod(method, 10'000'000);
}

void readProperty(const std::string& address, const Words& words) {
  const auto connection = connected(address);
  const auto proxy = sdbus::createProxy(*connection, words.at(0), words.at(1));
  const std::string value = proxy->getProperty(words.at(3)).onInterface(words.at(2));
  if (value.empty()) throw sdbus::Error("empty");
}

Answer listen(const std::string& address, const std::string& match) {
  const auto connection = connected(address);
  bool heard = false;
  const auto slot = connection->addMatch(match, [&heard](sdbus::Message&) { heard = true; });
  std::puts("ready");
  std::fflush(stdout);
  const auto end = std::chrono::steady_clock::now() + 2s;
  while (!heard && std::chrono::steady_clock::now() < end) {
    while (connection->processPendingRequest()) {
    }
    std::this_thread::sleep_for(5ms);
  }
  return heard ? allowed : denied;
}

[[noreturn]] void readModem(const std::string& address) {
  class Nobody final : public sources::EventReceiver {
    Taken take(const sources::SourceEvent&) override { return Taken::yes; }
  };
  sources::ModemManagerSource source({}, {address}, {100ms, 2s});
  const auto receiver = std::make_shared<Nobody>();
  source.start(receiver, std::make_shared<sources::ListenerSignal>());
  while (true) ::pause();
}

Answer act(const std::string& address, const std::string& what, const Words& words) {
  try {
    if (what == "listen") return listen(address, words.at(0));
    if (what == "call") call(address, words);
    if (what == "property") readProperty(address, words);
    if (what == "own") connected(address)->requestName(words.at(0));
    if (what == "modem") readModem(address);
    return allowed;
  } catch (const sdbus::Error& error) {
    return error.getName() == "org.freedesktop.DBus.Error.AccessDenied" ? denied : other;
  }
}

}  // namespace
}  // namespace qel::testing

int main(int count, char** words) {
  using qel::testing::Words;
  const Words given(words + 1, words + count);
  if (given.size() < 4 || !qel::testing::become(given[0], given[1])) return qel::testing::other;
  // Without destroying what is static: leaks are not looked for by somebody else.
  std::_Exit(qel::testing::act(given[2], given[3], Words(given.begin() + 4, given.end())));
}
