// A client of the baseband manager service in a page: asks for the metrics of a configuration file
// and prints what comes. docs/bus.md explains each step.
//
//   bus_client BUS-ADDRESS CONFIGURATION-FILE EVENTS
#include <poll.h>
#include <sdbus-c++/sdbus-c++.h>
#include <sys/socket.h>

#include <array>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>

#include "event_packet.pb.h"  // protoc --cpp_out=. event_packet.proto

int main(int argc, char** argv) {
  if (argc != 4) return 64;
  const std::string interface = "tesk.BasebandManager1";
  const auto bus = sdbus::createSessionBusConnectionWithAddress(argv[1]);
  const auto service = sdbus::createProxy(*bus, interface, "/tesk/BasebandManager1");

  sdbus::UnixFd events;
  service->callMethod("Register")
      .onInterface(interface)
      .withArguments("example")
      .storeResultsTo(events);

  std::ifstream file(argv[2], std::ios::binary);
  const std::vector<std::uint8_t> configuration{std::istreambuf_iterator<char>(file), {}};
  const std::map<std::string, sdbus::Variant> request = {
      {"kKeyAppID", sdbus::Variant(std::int64_t{1000})},
      {"kKeyPayload", sdbus::Variant(configuration)},
      {"kKeyPayloadType", sdbus::Variant(std::int64_t{0})}};
  std::tuple<std::int32_t, std::string, std::map<std::string, sdbus::Variant>> answer;
  service->callMethod("PerformCommand")
      .onInterface(interface)
      .withArguments("kCommandAddConfiguration", request)
      .storeResultsTo(answer);
  if (std::get<0>(answer) != 0) {
    std::cerr << std::get<1>(answer) << '\n';
    return 1;
  }
  service->callMethod("SetDelivery").onInterface(interface).withArguments(true);

  std::array<char, 65536> bytes;
  for (long left = std::strtol(argv[3], nullptr, 10); left > 0; --left) {
    pollfd waited{events.get(), POLLIN, 0};  // the descriptor does not block
    ::poll(&waited, 1, -1);
    const ssize_t size = ::recv(events.get(), bytes.data(), bytes.size(), 0);
    qelwatch::schema::EventPacket packet;
    if (size <= 0 || !packet.ParseFromArray(bytes.data(), static_cast<int>(size))) return 69;
    for (const auto& entry : packet.entries()) {
      if (entry.key() == "kKeyMetricID") std::cout << "metric " << entry.integer() << '\n';
    }
  }
}
