// One connection to an MQTT 5 broker.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "fleet/BrokerAddress.h"
#include "fleet/Login.h"

struct mosquitto;
struct mqtt5__property;

namespace qel::fleet {

struct RetainedMessage {
  std::string topic;
  std::string text;
};

// What a client is told of others' messages.
struct Subscription {
  // Told in turn().
  using Delivery = std::function<void(std::string_view topic, std::string_view payload)>;

  std::string topics;  // with wildcards; "$share/GROUP/…": each message for one of them
  std::uint16_t mostUnderWay = 20;    // messages that are not acknowledged
  std::uint32_t largestPacket = 0;    // bytes; larger ones the broker keeps to itself
  std::chrono::seconds sessionAge{};  // how long it keeps for this client what comes meanwhile
  Delivery delivery;
};

struct LinkSettings {
  BrokerAddress broker;
  std::string client;  // by which the broker knows it
  std::optional<Login> login;
  std::string caFile;           // empty: the authorities that the system trusts
  std::string certificateFile;  // and its key: empty, or both
  std::string keyFile;
  std::chrono::seconds keepAlive{900};  // 0: the broker never hears of a silent client
  bool awaitsReceiver = false;          // nobody has taken what nobody has subscribed to
  RetainedMessage will;
  std::optional<Subscription> subscription;
};

// Why there is no connection.
struct LinkFailure {
  std::string why;         // a few words
  bool isRefusal = false;  // trying again changes nothing: login, certificate, protocol
};

// One thread; every call but the first is for when poll() says so and waits for nothing. TLS is 1.2
// or newer.
class BrokerLink {
 public:
  enum class State : std::uint8_t { greeting, open, ended };
  // Told in turn() that a message has arrived, or with the broker's reason why it was not taken.
  using Arrival = std::function<void(int message, const std::string& refusal)>;

  // Looks the host up and connects, as long as that takes. Nothing when it fails.
  static std::unique_ptr<BrokerLink> open(const LinkSettings& settings, Arrival arrival,
                                          LinkFailure& failure);
  ~BrokerLink();
  BrokerLink(const BrokerLink&) = delete;
  BrokerLink& operator=(const BrokerLink&) = delete;

  int descriptor() const;
  bool wantsToWrite() const;
  // The messages that were delivered so far are where they belong. Before that, or when that never
  // comes, the broker hears of none of them, and of nothing else that would have to be written.
  void acknowledge();
  // Reads and writes what goes, and keeps the connection alive.
  State turn(bool isReadable);
  State state() const { return _state; }
  const LinkFailure& failure() const { return _failure; }  // once it has ended
  std::chrono::seconds keepAlive() const { return _keepAlive; }

  enum class Retained : std::uint8_t { no, yes };
  // With QoS 1, in the next turn. The number by which its arrival is told; nothing when it does not
  // go out: it is larger than the broker takes (isTooLarge), or the link ends.
  std::optional<int> send(const std::string& topic, std::string_view text, Retained retained,
                          bool& isTooLarge);
  // Without the last will.
  void sayGoodbye();

 private:
  BrokerLink(const LinkSettings& settings, Arrival arrival);
  bool prepare(const LinkSettings& settings);
  bool prepareTls(const LinkSettings& settings);
  void holdBack(bool held) const;
  void note(int code);
  void hear(std::string_view complaint);
  void greeted(int reason, const mqtt5__property* properties);
  void ended(int code);
  void subscribe();
  void subscribed(int reason);
  static void setCallbacks(mosquitto* client);
  int connect(const LinkSettings& settings);

  struct EndClient {
    void operator()(mosquitto* client) const;
  };
  // A number that stands for a topic, once the broker has taken a message with both.
  struct Alias {
    std::uint16_t number = 0;
    bool isTaken = false;
  };
  void answered(int message, int reason);
  Alias* aliasOf(const std::string& topic);

  const Arrival _arrival;
  std::unique_ptr<mosquitto, EndClient> _client;
  State _state = State::greeting;
  LinkFailure _failure;
  const std::array<std::string, 3> _files;  // that are shown to the library
  std::string _faultyFile;                  // of these
  std::string _complaint;                   // of the library
  std::chrono::seconds _keepAlive;
  std::uint16_t _mostAliases = 0;
  std::map<std::string, Alias> _aliases;  // of topics
  std::map<int, Alias*> _aliasesAsked;    // by the messages that told the broker of them
  const bool _awaitsReceiver;
  const std::optional<Subscription> _subscription;
  bool _holdsAnswers = false;     // to messages that were delivered
  bool _isAcknowledging = false;  // some of these answers are not written yet
};

}  // namespace qel::fleet
