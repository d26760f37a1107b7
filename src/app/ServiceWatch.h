// Tells the reader when the baseband manager service is away.
#pragma once

#include <QtCore/QPointer>
#include <memory>
#include <string>

#include "tesk/bus/BusConnector.h"
#include "ui/quick/Navigation.h"

namespace qel {

// Main thread, but for the observer. The notice comes and goes by itself. A viewer that started
// without the service brings itself into service when the service is there for the first time.
class ServiceWatch final : public std::enable_shared_from_this<ServiceWatch> {
 public:
  // What the bus connection is to call; it may outlive the watch.
  tesk::bus::ReachabilityObserver observer();

  // From now on the window shows what is known.
  void showIn(Navigation& navigation);

 private:
  void change(bool reachable, const std::string& why);
  void show();

  QPointer<Navigation> _navigation;
  bool _wasReachable = false;
  bool _reachable = false;
  QString _notice;
};

}  // namespace qel
