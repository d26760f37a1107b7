// lying-service LIE --bus ADDRESS: takes the service's name and does not keep to its interface.

#include <fcntl.h>
#include <sdbus-c++/sdbus-c++.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <functional>
#include <iostream>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <thread>
#include <vector>

#include "tesk/bus/BusAddress.h"

namespace {

using namespace std::chrono_literals;

constexpr const char* kInterface = "tesk.BasebandManager1";
using Dictionary = std::map<std::string, sdbus::Variant>;
using Answer = std::tuple<std::int32_t, std::string, Dictionary>;

// The events of a client go nowhere; packets of these sizes go to it instead.
struct Stream {
  std::size_t shortest;
  std::size_t longest;
  std::chrono::milliseconds pause;
};

void send(int descriptor, Stream stream) {
  std::mt19937 random(1);
  std::vector<unsigned char> packet;
  while (true) {
    packet.resize(
        std::uniform_int_distribution<std::size_t>(stream.shortest, stream.longest)(random));
    for (auto& byte : packet) byte = static_cast<unsigned char>(random());
    if (::send(descriptor, packet.data(), packet.size(), MSG_NOSIGNAL) < 0) break;
    if (stream.pause > 0ms) std::this_thread::sleep_for(stream.pause);
  }
  ::close(descriptor);
}

std::array<int, 2> socketPair() {
  std::array<int, 2> ends{};
  if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends.data()) != 0) std::exit(1);
  return ends;
}

sdbus::UnixFd streamOf(Stream stream) {
  const auto ends = socketPair();
  constexpr int kRoom = 1 << 20;  // for one packet that is too long
  ::setsockopt(ends[0], SOL_SOCKET, SO_SNDBUF, &kRoom, sizeof kRoom);
  std::thread(send, ends[0], stream).detach();
  return sdbus::UnixFd(ends[1], sdbus::adopt_fd);
}

void honestButFor(sdbus::IObject& object, const std::function<sdbus::UnixFd()>& stream) {
  object.registerMethod("Register")
      .onInterface(kInterface)
      .implementedAs([stream](const std::string&) { return stream(); });
  object.registerMethod("SetDelivery").onInterface(kInterface).implementedAs([](const bool&) {});
  object.registerMethod("PerformCommand")
      .onInterface(kInterface)
      .implementedAs([](const std::string&, const Dictionary&) {
        return Answer{0, "done", {}};
      });
}

void neverAnswer(sdbus::IObject& object) {
  static std::vector<sdbus::Result<sdbus::UnixFd>> kept;
  object.registerMethod("Register")
      .onInterface(kInterface)
      .implementedAs([](sdbus::Result<sdbus::UnixFd>&& result, const std::string&) {
        kept.push_back(std::move(result));
      });
}

void wrongTypes(sdbus::IObject& object) {
  object.registerMethod("Register").onInterface(kInterface).implementedAs([](const std::string&) {
    return std::string("a text and no descriptor");
  });
  object.registerMethod("PerformCommand")
      .onInterface(kInterface)
      .implementedAs([](const std::string&, const Dictionary&) { return true; });
  object.registerProperty("Source").onInterface(kInterface).withGetter([] { return 1.5; });
  object.registerProperty("Clients").onInterface(kInterface).withGetter([] { return true; });
}

void errors(sdbus::IObject& object) {
  object.registerMethod("Register")
      .onInterface(kInterface)
      .implementedAs([](const std::string&) -> sdbus::UnixFd {
        throw sdbus::Error("tesk.Wrong", std::string(1000000, '\x1B') + "\n\n");
      });
}

sdbus::UnixFd closedStream() {
  const auto ends = socketPair();
  ::close(ends[0]);
  return sdbus::UnixFd(ends[1], sdbus::adopt_fd);
}

sdbus::UnixFd file() { return sdbus::UnixFd(::open("/dev/zero", O_RDONLY), sdbus::adopt_fd); }

using Lie = std::function<void(sdbus::IObject& object)>;

const std::map<std::string, Lie>& lies() {
  static const std::map<std::string, Lie> all = {
      {"hang", [](sdbus::IObject&) {}},
      {"never-answer", neverAnswer},
      {"wrong-types", wrongTypes},
      {"errors", errors},
      {"close", [](auto& object) { honestButFor(object, closedStream); }},
      {"a-file", [](auto& object) { honestButFor(object, file); }},
      {"garbage",
       [](auto& object) { honestButFor(object, [] {
                            return streamOf({1, 4000, 1ms});
                          }); }},
      {"over-long",
       [](auto& object) { honestButFor(object, [] {
                            return streamOf({65537, 200000, 1ms});
                          }); }},
      {"flood",
       [](auto& object) { honestButFor(object, [] {
                            return streamOf({1, 4000, 0ms});
                          }); }},
  };
  return all;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4 || !lies().contains(argv[1])) {
    std::cerr << "lying-service LIE --bus ADDRESS\n";
    return 64;
  }
  const auto connection = tesk::bus::connectTo({argv[3]});
  const auto object = sdbus::createObject(*connection, tesk::bus::kObjectPath);
  lies().at(argv[1])(*object);
  object->finishRegistration();
  connection->requestName(tesk::bus::kServiceName);
  if (std::string(argv[1]) == "hang") std::this_thread::sleep_for(24h);
  connection->enterEventLoop();
}
