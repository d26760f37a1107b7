// Sends what waits in the queue to a broker, in batches.
#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "base/WakeUp.h"
#include "fleet/BrokerLink.h"
#include "fleet/EventQueue.h"
#include "fleet/Retries.h"

namespace qel::fleet {

// Events go to qelwatch/PHONE/METRIC, each as its line with the keys "stream" and "number" at its
// end. Retained are qelwatch/PHONE/status, "online" or "offline", and qelwatch/PHONE/queue, what is
// known of gaps in the numbers.
struct PublishSettings {
  LinkSettings link;  // its client and will are set here
  std::string phone;
  std::chrono::milliseconds every{10'000};  // how long an event waits for others
  std::size_t batchBytes = 64 * 1024;       // that are sent earlier
  bool keepsTrying = false;                 // also when the broker refuses
};

// On a thread of its own, which sleeps while nothing is queued and nothing under way. What could
// not be sent waits; an event leaves the queue when the broker has it.
class Publisher {
 public:
  // Told on that thread, one line each.
  using Say = std::function<void(const std::string& line)>;

  Publisher(EventQueue& queue, PublishSettings settings, Say say);
  ~Publisher();
  Publisher(const Publisher&) = delete;
  Publisher& operator=(const Publisher&) = delete;

  // Any thread: an event of so many bytes is in the queue, or with 0 bytes is lost.
  void queued(std::size_t bytes);
  // What is known besides of events that are no part of the numbers.
  void setLeftOut(std::uint64_t undecodable) { _undecodable = undecodable; }

  // Sends what waits, says "offline" and ends the connection. False when that takes longer than it
  // may; the process must then end without the thread.
  bool end(std::chrono::milliseconds patience);
  // Once the broker has refused for good: why. Nobody tries again then.
  std::optional<std::string> refusal() const;
  // That the broker has.
  std::uint64_t sent() const { return _sent; }

 private:
  using Clock = std::chrono::steady_clock;
  static constexpr std::size_t kForgetTogether = 125;

  void run();
  void connect();
  void beginLink();
  void endLink();
  void loseLink(LinkFailure failure);
  void note(const LinkFailure& failure);
  void turn(short revents);
  void arrived(int message, const std::string& refusal);
  void forgetArrived();
  void sendBatch();
  bool sendNext();
  void sendStatus(std::string_view status);
  void tellOfQueue();
  bool isBatchDue(Clock::time_point now) const;
  bool isUnderWay() const { return !_underWay.empty(); }
  bool hasRoom() const;
  std::optional<Clock::time_point> nextTime(Clock::time_point now) const;
  void wait(std::optional<Clock::time_point> until);
  void leave();
  void sayLosses();
  std::string broker() const;
  std::string topic(std::string_view name) const;
  void sayOnce(const std::string& line);

  EventQueue& _queue;
  const PublishSettings _settings;
  const Say _say;
  WakeUp _wakeUp;
  std::atomic<bool> _ending = false;
  std::atomic<bool> _hasEnded = false;
  std::atomic<bool> _isRefused = false;
  std::atomic<std::size_t> _fresh = 0;  // bytes queued since the last batch began
  std::atomic<std::uint64_t> _sent = 0;
  std::atomic<std::uint64_t> _undecodable = 0;

  // Of the thread.
  std::unique_ptr<BrokerLink> _link;
  Retries _retries;
  std::map<int, std::uint64_t> _underWay;  // by the link's number; 0: no event
  std::vector<std::uint64_t> _arrived;     // to be removed from the queue, so many together
  std::size_t _forgetAt = kForgetTogether;
  std::uint64_t _sentUpTo = 0;
  bool _isSending = false;
  bool _isIntroduced = false;  // the broker has what this link began with
  bool _wasConnected = false;
  std::optional<Clock::time_point> _firstFresh;
  Clock::time_point _lastTraffic;
  std::string _toldOfQueue;
  std::string _greeting;            // until it is said
  std::string _turnedDown;          // why the broker did not take a message
  const std::uint64_t _lostBefore;  // when this began
  bool _hasSaidLoss = false;
  bool _hasSaidTooLarge = false;
  std::string _said;
  std::string _refusal;

  std::thread _thread;
};

}  // namespace qel::fleet
