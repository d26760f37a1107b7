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
constexpr std::size_t kLongestLine = 256;  // bytes

// Before the line is copied from thread to thread; no character is left in halves.
void shorten(std::string& line) {
  if (line.size() <= kLongestLine) return;
  const auto isWithinCharacter = [](char c) {
    return (static_cast<unsigned char>(c) & 0xC0) == 0x80;
  };
  std::size_t end = kLongestLine;
  while (end > 0 && isWithinCharacter(line[end])) --end;
  line.resize(end);
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
  tell("");
}

void ConditionWatch::take(const sdbus::Variant& condition) {
  ++_question;
  std::string line;
  if (condition.containsValueOfType<Entries>()) {
    const auto entries = condition.get<Entries>();
    const auto text = entries.find("text");
    if (text != entries.end() && text->second.containsValueOfType<std::string>()) {
      line = text->second.get<std::string>();
    }
  }
  shorten(line);
  tell(std::move(line));
}

void ConditionWatch::tell(std::string line) {
  if (!_observer || line == _told) return;
  _told = line;
  _observer(line);
}

}  // namespace tesk::bus
