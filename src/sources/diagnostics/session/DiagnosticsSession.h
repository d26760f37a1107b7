// What is said to a modem from the opening of its port to the end, and what of its packets counts.
#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/port/DiagPort.h"
#include "sources/diagnostics/requests/Answers.h"
#include "sources/diagnostics/requests/Request.h"

namespace qel::diagnostics {

// What is wanted of a modem: logs by their codes, events by their numbers.
struct WantedPackets {
  std::function<bool(std::uint16_t code)> log;
  std::function<bool(std::uint16_t id)> event;
};

struct SessionTiming {
  std::chrono::milliseconds answer{2000};        // a request is said again after it, once
  std::chrono::milliseconds drain{200};          // what an earlier program had asked for runs out
  std::chrono::milliseconds sharedCheck{30000};  // others may have set our masks anew
  std::chrono::milliseconds quietCheck{60000};   // without a packet: is the modem still there?
};

// Asks one thing at a time and waits for nothing: receive() when the port is readable, step() when
// that is due. Packets go to the sink while logs are on: those that were asked for alone. One
// thread; the port stays the caller's.
class DiagnosticsSession final : private PacketSink {
 public:
  using Clock = std::chrono::steady_clock;

  enum class State : std::uint8_t {
    starting,
    listening,  // logs are on
    resting,    // logs are off
    ended,      // and the modem knows
    lost,       // the port is gone
    silent,     // the modem does not answer
    refused,    // the modem will not send logs
  };

  DiagnosticsSession(DiagPort& port, PacketSink& sink, WantedPackets wanted,
                     const SessionTiming& timing, Clock::time_point now);

  void receive(Clock::time_point now);
  void step(Clock::time_point now);
  // When step() has something to do without a packet.
  Clock::time_point due() const;

  // Whether logs are to be on. At first they are.
  void listen(bool on, Clock::time_point now);
  // The modem may have forgotten what it was told: looks soon.
  void check(Clock::time_point now);
  // All off; ended, or lost, soon after.
  void end(Clock::time_point now);

  State state() const { return _state; }
  bool isOver() const { return _state >= State::ended; }
  const std::optional<ModemVersion>& version() const { return _version; }
  const std::optional<ModemBuild>& build() const { return _build; }
  std::uint64_t unwantedPackets() const { return _unwanted; }
  // How often the modem's masks were found to be others than ours.
  std::uint64_t replacedMasks() const { return _replacedMasks; }

 private:
  // What is over when there is no answer, or a refusal.
  enum class Need : std::uint8_t { canDoWithout, mustAnswer, mustBeGood };
  // A request and what to do with its answer; or a pause.
  struct Step {
    std::optional<Request> request;
    Need need = Need::canDoWithout;
    std::function<void(ByteView answer)> take = {};
  };
  enum class Goal : std::uint8_t { listen, rest, end };

  void log(const LogPacket& packet) override;
  void event(const ModemEvent& event) override;
  void answer(ByteView packet) override;

  void planStart();
  void planMasks();
  void planCheck();
  void planOff();
  void plan(Step step) { _steps.push_back(std::move(step)); }
  void go();
  void say();
  void finishStep();
  void unanswered();
  void stepsDone();
  bool wants(std::uint16_t code) const;
  Clock::time_point checkDue() const;

  DiagPort& _port;
  PacketSink& _sink;
  const WantedPackets _wanted;
  const SessionTiming _timing;
  PacketReader _packets{*this};

  State _state = State::starting;
  Goal _goal = Goal::listen;
  std::deque<Step> _steps;  // the first is under way once it has been begun
  bool _begun = false;
  int _times = 0;  // that its request was said
  Clock::time_point _now;
  Clock::time_point _saidAt;
  Clock::time_point _heardAt;
  Clock::time_point _checkedAt;
  bool _heard = false;  // anything at all

  std::vector<LogMask> _masks;
  bool _anyMaskSet = false;
  std::optional<ModemVersion> _version;
  std::optional<ModemBuild> _build;
  std::uint64_t _unwanted = 0;
  std::uint64_t _replacedMasks = 0;
};

}  // namespace qel::diagnostics
