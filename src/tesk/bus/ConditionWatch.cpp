#include "tesk/bus/ConditionWatch.h"

#include <cstddef>
#include <utility>
#include <vector>

#include "tesk/bus/BasebandManager1Proxy.h"
#include "tesk/bus/BusAddress.h"

namespace tesk::bus {
namespace {

constexpr auto kInterface = tesk::BasebandManager1_proxy::INTERFACE_NAME;
constexpr const char* kProperties = "org.freedesktop.DBus.Properties";
constexpr const char* kCondition = "Condition";
constexpr std::size_t kLongestText = 256;  // bytes

// Before the text is copied from thread to thread; no character is left in halves.
std::string shortened(std::string text) {
  if (text.size() <= kLongestText) return text;
  const auto isWithinCharacter = [](char c) {
    return (static_cast<unsigned char>(c) & 0xC0) == 0x80;
  };
  std::size_t end = kLongestText;
  while (end > 0 && isWithinCharacter(text[end])) --end;
  text.resize(end);
  return text;
}

std::string textAt(const std::map<std::string, sdbus::Variant>& entries, const char* key) {
  const auto found = entries.find(key);
  if (found == entries.end() || !found->second.containsValueOfType<std::string>()) return {};
  return shortened(found->second.get<std::string>());
}

}  // namespace

ConditionWatch::ConditionWatch(sdbus::IConnection& connection, sdbus::IProxy& service,
                               ConditionObserver observer)
    : _service(service), _observer(std::move(observer)) {
  if (!_observer) return;
  const std::string rule = std::string("type='signal',sender='") + kServiceName + "',path='" +
                           kObjectPath + "',interface='" + kProperties +
                           "',member='PropertiesChanged',arg0='" + kInterface + "'";
  _changes = connection.addMatch(rule, [this](sdbus::Message& signal) {
    try {
      std::string interface;
      Entries changed;
      signal >> interface >> changed;
      const auto found = changed.find(kCondition);
      if (found != changed.end()) take(found->second);
    } catch (const sdbus::Error&) {
      // Of other types than the interface has: no news.
    }
  });
}

void ConditionWatch::ask() {
  if (!_observer) return;
  const auto answer = [this, number = ++_question](const sdbus::Error* error,
                                                   const sdbus::Variant& condition) {
    if (!error && number == _question) take(condition);
  };
  try {
    _service.callMethodAsync("Get")
        .onInterface(kProperties)
        .withArguments(std::string(kInterface), std::string(kCondition))
        .uponReplyInvoke(answer);
  } catch (const sdbus::Error&) {
    // The connection is lost, as its owner will notice.
  }
}

void ConditionWatch::forget() {
  ++_question;
  tell({});
}

void ConditionWatch::take(const sdbus::Variant& condition) {
  ++_question;
  Condition told;
  if (condition.containsValueOfType<Entries>()) {
    const auto entries = condition.get<Entries>();
    told = {textAt(entries, "text"), textAt(entries, "state"), textAt(entries, "model"),
            textAt(entries, "reason")};
  }
  tell(std::move(told));
}

void ConditionWatch::tell(Condition condition) {
  if (!_observer || condition == _told) return;
  _told = std::move(condition);
  _observer(_told);
}

}  // namespace tesk::bus
