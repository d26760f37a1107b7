// A modem as the fake ModemManager shows it, and what its source makes of it.
#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/lte_serving.h"
#include "sources/Metrics.h"
#include "sources/modem_manager/FakeModemManager.h"
#include "sources/modem_manager/ModemManagerSource.h"
#include "support/PrivateBus.h"
#include "tesk/Constants.h"

namespace qel::testing {

inline const std::string kModemPath = "/org/freedesktop/ModemManager1/Modem/0";
inline const std::string kModem = "org.freedesktop.ModemManager1.Modem";
inline const std::string kModem3gpp = kModem + ".Modem3gpp";
inline const std::string kSignal = kModem + ".Signal";
inline const std::string kLocation = kModem + ".Location";
inline const std::string kBearer = "org.freedesktop.ModemManager1.Bearer";
inline const std::string kSim = "org.freedesktop.ModemManager1.Sim";
inline const std::string kBearerPath = "/org/freedesktop/ModemManager1/Bearer/0";
// Not under the manager, so that it is not listed, as the real one's are not.
inline const std::string kSimPath = "/sim/0";

inline constexpr std::uint32_t kOnLte = 1U << 14;
inline constexpr std::uint32_t kOnUmts = 1U << 5;
inline constexpr std::uint32_t kOnHspa = 1U << 8;
inline constexpr std::uint32_t kOnGsm = 1U << 1;

// Registered at home, in network 262-01.
inline FakeInterfaces modemOn(std::uint32_t technologies,
                              const std::string& imei = "350000000000011",
                              std::uint32_t rateS = 0) {
  return {{kModem,
           {{"State", std::int32_t{8}},
            {"AccessTechnologies", technologies},
            {"EquipmentIdentifier", imei},
            {"Sim", sdbus::ObjectPath("/")},
            {"Bearers", std::vector<sdbus::ObjectPath>()}}},
          {kModem3gpp,
           {{"RegistrationState", std::uint32_t{1}},
            {"PacketServiceState", std::uint32_t{1}},
            {"OperatorCode", std::string("26201")}}},
          {kSignal,
           {{"Rate", rateS},
            {"Lte", FakeDictionary()},
            {"Umts", FakeDictionary()},
            {"Gsm", FakeDictionary()}}},
          {kLocation,
           {{"Capabilities", std::uint32_t{0}},
            {"Enabled", std::uint32_t{0}},
            {"SignalsLocation", false},
            {"Location", std::map<std::uint32_t, sdbus::Variant>()}}}};
}

inline sdbus::Variant text(const char* value) { return sdbus::Variant(std::string(value)); }
inline sdbus::Variant number(std::uint32_t value) { return sdbus::Variant(value); }
inline sdbus::Variant level(double value) { return sdbus::Variant(value); }
inline sdbus::Variant flag(bool value) { return sdbus::Variant(value); }

// Takes the events of a source and keeps the newest of each metric.
class MetricLog final : public sources::EventReceiver {
 public:
  Taken take(const sources::SourceEvent& event) override {
    {
      const std::lock_guard lock(_mutex);
      const auto metric = static_cast<std::uint32_t>(
          *event.entries.find(tesk::kKeyMetricID)->asInt64() - std::int64_t{kMetricEventBase});
      _payloads[metric] = *event.entries.find(tesk::kKeyPayload)->asBytes();
      ++_counts[metric];
    }
    _changed.notify_all();
    return Taken::yes;
  }

  // The newest payload of the message's metric; an empty message while there is none.
  template <class Message>
  std::shared_ptr<Message> newest(std::uint32_t metric) const {
    const std::lock_guard lock(_mutex);
    const auto found = _payloads.find(metric);
    return found == _payloads.end() ? std::make_shared<Message>()
                                    : Message::initWithData(found->second);
  }

  // Until a message of the metric has come that is as wanted, for half a minute at most.
  template <class Message>
  bool waitFor(std::uint32_t metric, const std::function<bool(const Message&)>& wanted) const {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30), [&] {
      const auto found = _payloads.find(metric);
      return found != _payloads.end() && wanted(*Message::initWithData(found->second));
    });
  }
  bool waitForCount(std::uint32_t metric, int count) const {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30), [&] {
      const auto found = _counts.find(metric);
      return found != _counts.end() && found->second >= count;
    });
  }
  int count(std::uint32_t metric) const {
    const std::lock_guard lock(_mutex);
    const auto found = _counts.find(metric);
    return found == _counts.end() ? 0 : found->second;
  }

 private:
  mutable std::mutex _mutex;
  mutable std::condition_variable _changed;
  std::map<std::uint32_t, Bytes> _payloads;
  std::map<std::uint32_t, int> _counts;
};

// A modem whose signal tells which one it is.
inline FakeInterfaces modemWithRsrp(double dbm, const std::string& imei = "350000000000011") {
  auto modem = modemOn(kOnLte, imei);
  modem.at(kSignal).at("Lte") = FakeDictionary{{"rsrp", level(dbm)}};
  return modem;
}

inline std::string pathOf(int number) {
  return "/org/freedesktop/ModemManager1/Modem/" + std::to_string(number);
}

// A condition that becomes true in half a minute at most.
inline bool becomesTrue(const std::function<bool()>& condition) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  return true;
}

// A bus, a ModemManager and a source that watches it, with a short period unless told otherwise.
class ModemWorld {
 public:
  static constexpr sources::ModemTiming kShort{std::chrono::milliseconds(100),
                                               std::chrono::milliseconds(500)};

  // For what no call that takes long may disturb, however busy the machine is.
  static constexpr sources::ModemTiming kPatient{std::chrono::milliseconds(100),
                                                 std::chrono::seconds(30)};

  explicit ModemWorld(sources::ModemWish wish = {}, sources::ModemTiming timing = kShort)
      : manager(std::make_unique<FakeModemManager>(bus.address())),
        log(std::make_shared<MetricLog>()),
        source(std::make_unique<sources::ModemManagerSource>(wish, bus::BusAddress{bus.address()},
                                                             timing)) {}
  void start() { source->start(log, listeners); }

  // Whether the metric can be had.
  bool has(std::uint32_t metric) const { return source->query(metric).known; }

  bool waitForRsrp(std::int32_t dbm) const {
    return log->waitFor<KCellularLteRsrpRsrqSinr>(metric::kLteRsrpRsrqSinr, [dbm](const auto& m) {
      return m.instValues()[0]->rsrp0() == dbm;
    });
  }

  PrivateBus bus;
  std::unique_ptr<FakeModemManager> manager;
  std::shared_ptr<MetricLog> log;
  std::shared_ptr<sources::ListenerSignal> listeners = std::make_shared<sources::ListenerSignal>();
  std::unique_ptr<sources::ModemManagerSource> source;
};

}  // namespace qel::testing
