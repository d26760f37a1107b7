#include "harness/Attack.h"

#include <chrono>

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr auto kCallTimeout = 5s;

void attackOnce(const std::string& busAddress, const Attack::Deed& deed,
                const std::stop_token& stop) {
  const auto connection = tesk::bus::connectTo({busAddress});
  connection->setMethodCallTimeout(kCallTimeout);
  Proxy proxy(*connection);
  const auto events = proxy.Register("trial-attacker");
  while (!stop.stop_requested()) {
    deed(*connection, proxy);
    while (!stop.stop_requested() && connection->processPendingRequest()) {
    }
  }
}

}  // namespace

Attack::Attack(std::string busAddress, Deed deed)
    : _thread([busAddress = std::move(busAddress),
               deed = std::move(deed)](const std::stop_token& stop) {
        while (!stop.stop_requested()) {
          try {
            attackOnce(busAddress, deed, stop);
          } catch (const sdbus::Error&) {
            std::this_thread::sleep_for(10ms);
          }
        }
      }) {}

}  // namespace qel::trials
