// The viewer's connection, for the subcommands that show live values without a window.
#pragma once

#include <functional>
#include <string>

#include "tesk/bus/BusConnector.h"
#include "tools/MainLoop.h"

namespace qel::tools {

// Configuration, delivery, SIM files: what the viewer's start does, again each time.
void startAsTheViewerDoes();

struct LiveOptions {
  std::string bus = "system";
  std::function<void(const std::string&)> say;  // what becomes of the service
  tesk::bus::ReachabilityObserver reachability = {};
  tesk::bus::ConditionObserver condition = {};
};

// Connects to the service and starts as the viewer does. A ToolError when the service is not there
// within two seconds.
void connectToService(const LiveOptions& options, MainLoop& loop);
// The same for programs that show that it is not there, and that it has come.
void connectWithoutWaiting(const LiveOptions& options, MainLoop& loop);

}  // namespace qel::tools
