// Events of a source through the service, the dispatcher and the store to every screen: what the
// service lets pass must never end a viewer.

#include <vector>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/device_config.h"
#include "metrics/MetricValidator.h"
#include "service/ServiceCore.h"
#include "service/support/Configuration.h"
#include "service/support/FakeSource.h"
#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"
#include "ui/Tables.h"
#include "ui/screens/QelViewItems.h"

namespace qel::fuzz {
namespace {

using sources::SourceEvent;

constexpr int kMostEvents = 16;

Bytes everything() {
  DeviceConfig message;
  message.setFormat(1);
  for (const MetricName& name : KBBMetricUtility::catalogue()) {
    auto metric = std::make_shared<ConfiguredMetric>();
    metric->setIdentifier(name.identifier);
    message.addMetric(metric);
  }
  auto trigger = std::make_shared<ConfiguredTrigger>();
  trigger->setFirst(0);
  trigger->setLast(0xFFFFFFFF);
  message.addTrigger(trigger);
  return message.data();
}

// The service and a viewer in one process, with all screens of the menu open.
class World {
 public:
  World() {
    _session = _core->open(
        "viewer", [this](std::string_view name, tesk::Message event) { receive(name, event); });
    _core->eventsOn(*_session);
    const auto installed = _core->performCommand(*_session, tesk::kCommandAddConfiguration,
                                                 testing::addRequest(everything()));
    law(installed.code == 0, installed.message);
    const QelViewItems items;
    for (const std::string& technology : items.launchViewItemNames) {
      for (const std::string& category : items.firstLevelViewItems.at(technology)) {
        _screens.push_back(testing::categoryTable(technology, category));
      }
    }
  }

  void begin(bool overBus) {
    _overBus = overBus;
    static_cast<MetricStore&>(*_viewer) = MetricStore();
  }
  void send(const SourceEvent& event) { _core->take(event); }
  void draw() {
    for (const auto& screen : _screens) snapshotOf(*screen);
  }

 private:
  void receive(std::string_view name, const tesk::Message& event) {
    if (!_overBus) return show(name, event.entries());
    const auto packet = tesk::bus::encodeEvent(name, event);
    if (!packet) return;  // too large, and counted as such
    const auto arrived = tesk::bus::decodeEvent(*packet);
    law(arrived.has_value(), "every packet that is made can be read");
    show(arrived->name, arrived->message.entries());
  }
  void show(std::string_view name, const Dictionary& event) {
    if (name == tesk::kEventMetric) {
      _viewer->metricsDidUpdate(event);
    } else {
      _viewer->eventsDidUpdate(event);
    }
  }

  bool _overBus = false;
  std::shared_ptr<MetricValidator> _viewer = MetricValidator::shared();
  std::shared_ptr<service::ServiceCore> _core = service::ServiceCore::create(
      std::make_unique<testing::FakeSource>(std::make_shared<testing::FakeSourceState>()));
  std::shared_ptr<service::Session> _session;
  std::vector<std::shared_ptr<SecondLevelViewController>> _screens;
};

SourceEvent nextEvent(Input& input) {
  constexpr std::uint8_t kIsTrigger = 1;
  constexpr std::uint8_t kHasMore = 2;
  constexpr std::uint8_t kHasNoPayload = 4;
  constexpr std::uint8_t kIsOdd = 8;
  const std::uint8_t kind = input.byte();
  const auto metrics = metricMessages();
  const std::size_t which = input.byte();
  const std::uint32_t metric =
      which < metrics.size() ? metrics[which].identifier : input.number<std::uint32_t>();
  SourceEvent event{input.number<std::uint64_t>(), tesk::kEventMetric, {}};
  if ((kind & kIsTrigger) != 0) {
    event.stream = tesk::kEventTrigger;
    event.entries.set(tesk::kKeyTriggerID, std::int64_t{metric});
  } else {
    event.entries.set(tesk::kKeyMetricID, std::int64_t{metric} + std::int64_t{kMetricEventBase});
  }
  if ((kind & kHasNoPayload) == 0) event.entries.set(tesk::kKeyPayload, input.piece());
  if ((kind & kIsOdd) != 0) event.entries.set(tesk::kKeyPayload, input.value());
  if ((kind & kHasMore) != 0) {
    for (const auto& [key, value] : input.entries()) event.entries.set(key, value);
  }
  return event;
}

}  // namespace

void tryInput(Input input) {
  static World& world = *new World;
  world.begin((input.byte() & 1) != 0);
  for (int i = 0; i < kMostEvents && !input.empty(); ++i) world.send(nextEvent(input));
  world.draw();
}

}  // namespace qel::fuzz
