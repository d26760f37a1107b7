#include "fleet/BrokerLink.h"

#include <mosquitto.h>
#include <mqtt_protocol.h>
#include <netdb.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <utility>

namespace qel::fleet {
namespace {

constexpr int kAtLeastOnce = 1;
constexpr int kMostUnderWay = 1000;  // messages; a broker that takes fewer says so

void beginLibrary() {
  static const int kBegun = mosquitto_lib_init();
  static_cast<void>(kBegun);
}

// What cannot be otherwise the next time.
bool isLastWord(int reason) {
  constexpr std::array kLast = {
      MQTT_RC_UNSUPPORTED_PROTOCOL_VERSION,
      MQTT_RC_CLIENTID_NOT_VALID,
      MQTT_RC_BAD_USERNAME_OR_PASSWORD,
      MQTT_RC_NOT_AUTHORIZED,
      MQTT_RC_BANNED,
      MQTT_RC_BAD_AUTHENTICATION_METHOD,
      MQTT_RC_RETAIN_NOT_SUPPORTED,
      MQTT_RC_QOS_NOT_SUPPORTED,
      MQTT_RC_SHARED_SUBS_NOT_SUPPORTED,
      MQTT_RC_WILDCARD_SUBS_NOT_SUPPORTED,
  };
  return std::ranges::find(kLast, reason) != kLast.end();
}

std::string lowered(std::string text) {
  while (text.ends_with('.')) text.pop_back();
  if (text.size() > 1 && text[0] >= 'A' && text[0] <= 'Z' && text[1] >= 'a') {
    text[0] = static_cast<char>(text[0] - 'A' + 'a');
  }
  return text;
}

std::string reasonText(int reason) { return lowered(mosquitto_reason_string(reason)); }

// Of "OpenSSL Error[0]: error:0A000086:SSL routines::certificate verify failed" what stands last.
std::string lastPart(const std::string& complaint) {
  return complaint.substr(complaint.rfind(':') + 1);
}

const char* orNone(const std::string& text) { return text.empty() ? nullptr : text.c_str(); }

}  // namespace

void BrokerLink::EndClient::operator()(mosquitto* client) const { mosquitto_destroy(client); }

BrokerLink::BrokerLink(const LinkSettings& settings, Arrival arrival)
    : _arrival(std::move(arrival)),
      _files({settings.caFile, settings.certificateFile, settings.keyFile}),
      _keepAlive(settings.keepAlive),
      _awaitsReceiver(settings.awaitsReceiver),
      _subscription(settings.subscription) {
  beginLibrary();
  _client.reset(mosquitto_new(settings.client.c_str(), !_subscription, this));
}

BrokerLink::~BrokerLink() = default;

void BrokerLink::setCallbacks(mosquitto* client) {
  using Link = BrokerLink;
  mosquitto_connect_v5_callback_set(
      client, [](mosquitto*, void* link, int reason, int, const mosquitto_property* properties) {
        static_cast<Link*>(link)->greeted(reason, properties);
      });
  mosquitto_disconnect_v5_callback_set(
      client, [](mosquitto*, void* link, int code, const mosquitto_property*) {
        static_cast<Link*>(link)->ended(code);
      });
  mosquitto_publish_v5_callback_set(
      client, [](mosquitto*, void* link, int message, int reason, const mosquitto_property*) {
        static_cast<Link*>(link)->answered(message, reason);
      });
  mosquitto_subscribe_v5_callback_set(
      client, [](mosquitto*, void* link, int, int, const int* granted, const mosquitto_property*) {
        static_cast<Link*>(link)->subscribed(*granted);
      });
  mosquitto_message_v5_callback_set(client, [](mosquitto*, void* link,
                                               const mosquitto_message* message,
                                               const mosquitto_property*) {
    auto& self = *static_cast<Link*>(link);
    self._holdsAnswers = true;
    self._subscription->delivery(message->topic, {static_cast<const char*>(message->payload),
                                                  static_cast<std::size_t>(message->payloadlen)});
  });
  mosquitto_log_callback_set(client, [](mosquitto*, void* link, int level, const char* text) {
    if (level == MOSQ_LOG_ERR) static_cast<Link*>(link)->hear(text);
  });
}

bool BrokerLink::prepareTls(const LinkSettings& settings) {
  mosquitto* client = _client.get();
  if (!settings.broker.isEncrypted) return true;
  int code = settings.caFile.empty() ? mosquitto_int_option(client, MOSQ_OPT_TLS_USE_OS_CERTS, 1)
                                     : MOSQ_ERR_SUCCESS;
  if (code == MOSQ_ERR_SUCCESS) {
    // A key with a passphrase has nobody to ask for it.
    const auto noPassphrase = [](char*, int, int, void*) { return 0; };
    code =
        mosquitto_tls_set(client, orNone(settings.caFile), nullptr,
                          orNone(settings.certificateFile), orNone(settings.keyFile), noPassphrase);
  }
  if (code != MOSQ_ERR_SUCCESS) note(code);
  return code == MOSQ_ERR_SUCCESS;
}

bool BrokerLink::prepare(const LinkSettings& settings) {
  mosquitto* client = _client.get();
  setCallbacks(client);
  // Nothing is written but in turn(): not even the answer to a message, which the library has ready
  // before it delivers it.
  mosquitto_threaded_set(client, true);
  mosquitto_int_option(client, MOSQ_OPT_PROTOCOL_VERSION, MQTT_PROTOCOL_V5);
  mosquitto_int_option(client, MOSQ_OPT_SEND_MAXIMUM, kMostUnderWay);
  if (_subscription) {
    mosquitto_int_option(client, MOSQ_OPT_RECEIVE_MAXIMUM, _subscription->mostUnderWay);
  }
  int code = MOSQ_ERR_SUCCESS;
  if (settings.login) {
    code = mosquitto_username_pw_set(client, settings.login->user.c_str(),
                                     orNone(settings.login->password));
  }
  if (code == MOSQ_ERR_SUCCESS && !settings.will.topic.empty()) {
    code = mosquitto_will_set_v5(client, settings.will.topic.c_str(),
                                 static_cast<int>(settings.will.text.size()),
                                 settings.will.text.data(), kAtLeastOnce, true, nullptr);
  }
  if (code == MOSQ_ERR_SUCCESS) return prepareTls(settings);
  note(code);
  return false;
}

std::unique_ptr<BrokerLink> BrokerLink::open(const LinkSettings& settings, Arrival arrival,
                                             LinkFailure& failure) {
  std::unique_ptr<BrokerLink> link(new BrokerLink(settings, std::move(arrival)));
  if (link->prepare(settings)) {
    const int code = link->connect(settings);
    if (code == MOSQ_ERR_SUCCESS) return link;
    link->note(code);
  }
  failure = link->_failure;
  return nullptr;
}

int BrokerLink::connect(const LinkSettings& settings) {
  mosquitto_property* wishes = nullptr;
  if (_subscription) {
    mosquitto_property_add_int32(&wishes, MQTT_PROP_SESSION_EXPIRY_INTERVAL,
                                 static_cast<std::uint32_t>(_subscription->sessionAge.count()));
    mosquitto_property_add_int32(&wishes, MQTT_PROP_MAXIMUM_PACKET_SIZE,
                                 _subscription->largestPacket);
  }
  const int code =
      mosquitto_connect_bind_v5(_client.get(), settings.broker.host.c_str(), settings.broker.port,
                                static_cast<int>(settings.keepAlive.count()), nullptr, wishes);
  mosquitto_property_free_all(&wishes);
  return code;
}

// Of a file the library says first that it cannot use it, then the cause, then what came of that.
void BrokerLink::hear(std::string_view complaint) {
  for (const std::string& file : _files) {
    if (file.empty() || complaint.find('"' + file + '"') == std::string_view::npos) continue;
    _faultyFile = file;
    _complaint.clear();
    return;
  }
  if (_faultyFile.empty() || _complaint.empty()) _complaint = complaint;
}

// Why it ended, as far as that was not noted before.
void BrokerLink::note(int code) {
  const int error = errno;
  _state = State::ended;
  if (!_failure.why.empty()) return;
  if (code == MOSQ_ERR_TLS || code == MOSQ_ERR_TLS_HANDSHAKE ||
      _complaint.find("OpenSSL") != std::string::npos) {
    _failure.why = "TLS: " + (_faultyFile.empty() ? "" : _faultyFile + ": ") +
                   (_complaint.empty() ? "no agreement" : lastPart(_complaint));
    _failure.isRefusal = true;
  } else if (code == MOSQ_ERR_EAI) {
    _failure.why = lowered(::gai_strerror(error));
  } else if (code == MOSQ_ERR_ERRNO) {
    _failure.why = std::strerror(error);
  } else if (code > MQTT_RC_UNSPECIFIED) {  // the broker's own reason for the end
    _failure.why = reasonText(code);
  } else {
    _failure.why = lowered(mosquitto_strerror(code));
  }
}

void BrokerLink::greeted(int reason, const mqtt5__property* properties) {
  if (reason != MQTT_RC_SUCCESS) {
    _failure = {"the broker refuses: " + reasonText(reason), isLastWord(reason)};
    _state = State::ended;
    return;
  }
  std::uint16_t wanted = 0;
  if (mosquitto_property_read_int16(properties, MQTT_PROP_SERVER_KEEP_ALIVE, &wanted, false)) {
    _keepAlive = std::chrono::seconds(wanted);
  }
  mosquitto_property_read_int16(properties, MQTT_PROP_TOPIC_ALIAS_MAXIMUM, &_mostAliases, false);
  if (_subscription) {
    subscribe();
  } else {
    _state = State::open;
  }
}

void BrokerLink::subscribe() {
  const int code = mosquitto_subscribe_v5(_client.get(), nullptr, _subscription->topics.c_str(),
                                          kAtLeastOnce, 0, nullptr);
  if (code != MOSQ_ERR_SUCCESS) note(code);
}

void BrokerLink::subscribed(int reason) {
  if (reason < MQTT_RC_UNSPECIFIED) {
    _state = State::open;
    return;
  }
  _failure = {
      "the broker gives no messages of " + _subscription->topics + ": " + reasonText(reason),
      isLastWord(reason)};
  _state = State::ended;
}

void BrokerLink::ended(int code) { note(code); }

int BrokerLink::descriptor() const { return mosquitto_socket(_client.get()); }
bool BrokerLink::wantsToWrite() const {
  return !_holdsAnswers && mosquitto_want_write(_client.get());
}

void BrokerLink::acknowledge() { _isAcknowledging = std::exchange(_holdsAnswers, false); }

BrokerLink::State BrokerLink::turn(bool isReadable) {
  mosquitto* client = _client.get();
  int code = MOSQ_ERR_SUCCESS;
  // Several messages become few packets of the network. And a broker that turns down the
  // certificate says why and hangs up, after which writing fails: so what follows the certificate
  // leaves with it.
  const bool mayWrite = !_subscription || _state == State::greeting || wantsToWrite();
  if (mayWrite) holdBack(true);
  // An answer to what is read now would be written behind those that go out.
  if (isReadable && !_isAcknowledging) code = mosquitto_loop_read(client, kMostUnderWay);
  if (code == MOSQ_ERR_SUCCESS) code = mosquitto_loop_misc(client);
  if (code == MOSQ_ERR_SUCCESS && wantsToWrite()) code = mosquitto_loop_write(client, 1);
  if (mayWrite) holdBack(false);
  _isAcknowledging = _isAcknowledging && wantsToWrite();
  if (code != MOSQ_ERR_SUCCESS) note(code);
  return _state;
}

std::optional<int> BrokerLink::send(const std::string& topic, std::string_view text,
                                    Retained retained, bool& isTooLarge) {
  Alias* const alias = retained == Retained::no ? aliasOf(topic) : nullptr;
  mosquitto_property* properties = nullptr;
  if (alias) mosquitto_property_add_int16(&properties, MQTT_PROP_TOPIC_ALIAS, alias->number);
  const bool isNamed = !alias || !alias->isTaken;
  int message = 0;
  const int code = mosquitto_publish_v5(_client.get(), &message, isNamed ? topic.c_str() : nullptr,
                                        static_cast<int>(text.size()), text.data(), kAtLeastOnce,
                                        retained == Retained::yes, properties);
  mosquitto_property_free_all(&properties);
  if (code == MOSQ_ERR_SUCCESS) {
    if (alias && isNamed) _aliasesAsked.emplace(message, alias);
    return message;
  }
  isTooLarge = code == MOSQ_ERR_OVERSIZE_PACKET || code == MOSQ_ERR_PAYLOAD_SIZE;
  if (!isTooLarge) note(code);
  return std::nullopt;
}

// A number for the topic, as long as the broker remembers so many. A broker forgets the number of a
// message that it refuses, and hangs up at the next one that has nothing but the number.
BrokerLink::Alias* BrokerLink::aliasOf(const std::string& topic) {
  const auto known = _aliases.find(topic);
  if (known != _aliases.end()) return &known->second;
  if (_aliases.size() >= _mostAliases) return nullptr;
  const auto next = static_cast<std::uint16_t>(_aliases.size() + 1);
  return &_aliases.emplace(topic, Alias{next}).first->second;
}

void BrokerLink::answered(int message, int reason) {
  const bool isForNobody = _awaitsReceiver && reason == MQTT_RC_NO_MATCHING_SUBSCRIBERS;
  const bool isRefused = reason >= MQTT_RC_UNSPECIFIED || isForNobody;
  if (const auto asked = _aliasesAsked.extract(message)) asked.mapped()->isTaken |= !isRefused;
  _arrival(message, isRefused ? reasonText(reason) : "");
}

void BrokerLink::holdBack(bool held) const {
  const int value = held ? 1 : 0;
  ::setsockopt(descriptor(), IPPROTO_TCP, TCP_CORK, &value, sizeof value);
}

void BrokerLink::sayGoodbye() {
  mosquitto_disconnect_v5(_client.get(), 0, nullptr);
  turn(false);
}

}  // namespace qel::fleet
