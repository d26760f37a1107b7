// Tells the reader when the baseband manager service is away.
#pragma once

#include <QtCore/QPointer>
#include <memory>
#include <string>
#include <utility>

#include "tesk/bus/BusConnector.h"
#include "ui/quick/Navigation.h"

namespace qel {

// Main thread, but for the observer. The notice comes and goes by itself. A viewer whose start
// found no service makes it when the service is there; from the event loop, since it waits for
// answers.
class ServiceWatch final : public std::enable_shared_from_this<ServiceWatch> {
 public:
  // On which bus the service is looked for.
  explicit ServiceWatch(std::string bus = "system") : _bus(std::move(bus)) {}

  // What the bus connection is to call; it may outlive the watch.
  tesk::bus::ReachabilityObserver observer();

  // From now on the window shows what is known.
  void showIn(Navigation& navigation);

 private:
  void change(bool reachable, const std::string& why);
  void show();

  const std::string _bus;
  QPointer<Navigation> _navigation;
  bool _reachable = false;
  QString _since;  // time of the loss; empty when there was none
  QString _notice;
};

}  // namespace qel
