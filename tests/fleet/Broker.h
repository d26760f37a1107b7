// Debian's MQTT broker and its subscriber, on a loopback port of the test's own.
#pragma once

#include <algorithm>
#include <cstdint>
#include <ios>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "support/ChildProcess.h"

namespace qel::testing {

// A port of the loopback device that nobody listens to.
std::uint16_t freePort();
// Whether somebody does.
bool isListening(std::uint16_t port);

// Listens once it is made. What it keeps survives its end, in the directory.
class Broker {
 public:
  // `more` are lines of its configuration, of the listener too; anybody may come unless they say
  // otherwise.
  explicit Broker(std::string directory, const std::string& more = "");

  std::uint16_t port() const { return _port; }
  std::string url() const { return "mqtt://127.0.0.1:" + std::to_string(_port); }
  // Brings sessions to the disk: they are there when it returns.
  void save();
  void kill();
  void start();
  ChildProcess& process() { return *_process; }

 private:
  const std::string _directory;
  const std::uint16_t _port;
  std::unique_ptr<ChildProcess> _process;
};

struct Received {
  std::string topic;
  bool isRetained = false;
  std::string payload;
};

// Everything below qelwatch/ from its making on, in a session that outlives connections. Throws
// when one number comes with two payloads.
class Subscriber {
 public:
  Subscriber(const Broker& broker, std::string file, std::vector<std::string> more = {});

  const std::vector<Received>& received() const;
  // The numbers of events, in the order of their arrival; the largest, 0 for none; and each event
  // once.
  const std::vector<std::uint64_t>& numbers() const;
  std::uint64_t newest() const;
  const std::map<std::uint64_t, std::string>& events() const;
  // The newest payload of the topic qelwatch/PHONE/NAME.
  std::string last(const std::string& phone, const std::string& name) const;

 private:
  const std::string _file;
  ChildProcess _process;
  mutable std::streamoff _readUpTo = 0;
  mutable std::vector<Received> _received;
  mutable std::vector<std::uint64_t> _numbers;
  mutable std::map<std::uint64_t, std::string> _events;
};

// Receivers of a broker that is killed. What the broker has acknowledged it may forget, and who
// acknowledges what it sends loses what is under way when the connection breaks; who does not
// acknowledge loses nothing then, but gets nothing that comes while it is away. Together they get
// everything, when both receive again before the next kill.
class SureSubscriber {
 public:
  SureSubscriber(const Broker& broker, const std::string& file)
      : _acknowledging(broker, file, {"-i", "acknowledging"}),
        _listening(broker, file + ".0", {"-i", "listening", "-q", "0"}) {}

  // Waits until both have events that are newer than any before. What waited for them meanwhile
  // they have then, too.
  bool receiveMore() const;
  std::uint64_t newest() const { return std::max(_acknowledging.newest(), _listening.newest()); }
  // Each event once, by its number.
  std::map<std::uint64_t, std::string> events() const;

 private:
  Subscriber _acknowledging;
  Subscriber _listening;
};

}  // namespace qel::testing
