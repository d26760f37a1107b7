#include "fleet/Broker.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <utility>

#include "support/Subprocess.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

sockaddr_in loopback(std::uint16_t port) {
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(port);
  return address;
}

std::vector<std::string> subscription(const Broker& broker, std::vector<std::string> more) {
  std::vector<std::string> words = {"/usr/bin/mosquitto_sub",
                                    "-h",
                                    "127.0.0.1",
                                    "-p",
                                    std::to_string(broker.port()),
                                    "-V",
                                    "mqttv5",
                                    "-i",
                                    "receiver",
                                    "-c",
                                    "-q",
                                    "1",
                                    "-D",
                                    "connect",
                                    "receive-maximum",
                                    "65535",
                                    "-t",
                                    "qelwatch/#",
                                    "-F",
                                    "%t %r %p"};
  words.insert(words.end(), more.begin(), more.end());
  return words;
}

std::string twofold(std::uint64_t number) {
  return "two events have the number " + std::to_string(number);
}

}  // namespace

std::uint16_t freePort() {
  const int descriptor = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  sockaddr_in address = loopback(0);
  socklen_t size = sizeof address;
  const bool isBound = ::bind(descriptor, reinterpret_cast<const sockaddr*>(&address), size) == 0 &&
                       ::getsockname(descriptor, reinterpret_cast<sockaddr*>(&address), &size) == 0;
  ::close(descriptor);
  if (!isBound) throw std::runtime_error("no free port");
  return ntohs(address.sin_port);
}

bool isListening(std::uint16_t port) {
  const int descriptor = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  const sockaddr_in address = loopback(port);
  const bool isThere =
      ::connect(descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
  ::close(descriptor);
  return isThere;
}

Broker::Broker(std::string directory, const std::string& more)
    : _directory(std::move(directory)), _port(freePort()) {
  // Started by root it would give up root's rights, and not see the test's directory.
  std::ofstream(_directory + "/broker.conf")
      << "user root\npersistence true\npersistence_location " << _directory
      << "/\nmax_inflight_messages 0\nmax_queued_messages 0\nallow_anonymous true\nlistener "
      << _port << " 127.0.0.1\n"
      << more;
  start();
}

void Broker::start() {
  if (_process) {
    _process->start();
  } else {
    _process = std::make_unique<ChildProcess>(
        Launch{.words = {"/usr/sbin/mosquitto", "-c", _directory + "/broker.conf"},
               .out = _directory + "/broker.log",
               .err = _directory + "/broker.log"});
  }
  if (!eventually([this] { return isListening(_port); })) throw std::runtime_error("no broker");
}

void Broker::save() {
  const std::string kept = _directory + "/mosquitto.db";
  std::filesystem::remove(kept);
  _process->signal(SIGUSR1);
  if (!eventually([&] { return std::filesystem::exists(kept); })) {
    throw std::runtime_error("the broker keeps no sessions");
  }
}

void Broker::kill() {
  _process->signal(SIGKILL);
  _process->waitForEnd();
}

Subscriber::Subscriber(const Broker& broker, std::string file, std::vector<std::string> more)
    : _file(std::move(file)),
      _process(
          {.words = subscription(broker, std::move(more)), .out = _file, .err = _file + ".err"}) {
  // A retained message comes at once to whoever has subscribed.
  const auto told =
      run("/usr/bin/mosquitto_pub", {"-h", "127.0.0.1", "-p", std::to_string(broker.port()), "-r",
                                     "-q", "1", "-t", "qelwatch/test/ready", "-m", "ready"});
  if (told.exitCode != 0 || !eventually([this] { return !received().empty(); })) {
    throw std::runtime_error("nobody has subscribed: " + told.err);
  }
}

const std::vector<Received>& Subscriber::received() const {
  std::ifstream stream(_file);
  stream.seekg(_readUpTo);
  for (std::string line; std::getline(stream, line) && !stream.eof();) {
    _readUpTo += static_cast<std::streamoff>(line.size() + 1);
    const auto first = line.find(' ');
    const auto second = line.find(' ', first + 1);
    if (second == std::string::npos) continue;
    _received.push_back({line.substr(0, first), line[first + 1] == '1', line.substr(second + 1)});
    const auto payload = nlohmann::json::parse(_received.back().payload, nullptr, false);
    if (!payload.is_object() || !payload.contains("number")) continue;
    _numbers.push_back(payload["number"]);
    const auto [same, isNew] = _events.emplace(_numbers.back(), _received.back().payload);
    if (!isNew && same->second != _received.back().payload) {
      throw std::runtime_error(twofold(_numbers.back()));
    }
  }
  return _received;
}

const std::vector<std::uint64_t>& Subscriber::numbers() const {
  received();
  return _numbers;
}

std::uint64_t Subscriber::newest() const {
  received();
  return _events.empty() ? 0 : _events.rbegin()->first;
}

const std::map<std::uint64_t, std::string>& Subscriber::events() const {
  received();
  return _events;
}

std::string Subscriber::last(const std::string& phone, const std::string& name) const {
  std::string payload;
  for (const Received& each : received()) {
    if (each.topic == "qelwatch/" + phone + "/" + name) payload = each.payload;
  }
  return payload;
}

bool SureSubscriber::receiveMore() const {
  const std::uint64_t before = _listening.newest();
  if (!eventually([&] { return _listening.newest() > before + 20; })) return false;
  const std::uint64_t reached = _listening.newest();
  return eventually([&] { return _acknowledging.newest() >= reached; });
}

std::map<std::uint64_t, std::string> SureSubscriber::events() const {
  auto all = _acknowledging.events();
  for (const auto& [number, payload] : _listening.events()) {
    const auto [same, isNew] = all.emplace(number, payload);
    if (!isNew && same->second != payload) throw std::runtime_error(twofold(number));
  }
  return all;
}

}  // namespace qel::testing
