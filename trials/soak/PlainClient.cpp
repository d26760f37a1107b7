#include "soak/PlainClient.h"

#include <poll.h>
#include <sys/socket.h>

#include <array>

#include "harness/Requests.h"
#include "tesk/bus/EventPacket.h"

namespace qel::trials {
namespace {

constexpr std::int64_t kApplication = 77;
constexpr int kLookMs = 100;

}  // namespace

PlainClient::PlainClient(const std::string& busAddress)
    : _connection(tesk::bus::connectTo({busAddress})), _proxy(*_connection) {
  _stream = _proxy.Register(kName);
  _proxy.PerformCommand("kCommandAddConfiguration",
                        installRequest(kApplication, viewersConfiguration()));
  _proxy.SetDelivery(true);
  _thread = std::thread([this] { read(); });
}

PlainClient::~PlainClient() {
  _stopping = true;
  _thread.join();
}

void PlainClient::read() {
  std::array<std::uint8_t, tesk::bus::kLargestPacket + 1> packet;
  while (!_stopping) {
    pollfd waited{_stream.get(), POLLIN, 0};
    if (::poll(&waited, 1, kLookMs) <= 0) continue;
    const ssize_t size = ::recv(_stream.get(), packet.data(), packet.size(), MSG_DONTWAIT);
    if (size == 0) return;
    if (size > 0 && tesk::bus::decodeEvent({packet.data(), static_cast<std::size_t>(size)})) {
      ++_events;
    }
  }
}

}  // namespace qel::trials
