// The viewer's connection, for the subcommands that show live values without a window.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "history/History.h"
#include "tesk/bus/BusConnector.h"
#include "tools/MainLoop.h"
#include "tools/Output.h"
#include "ui/pages/Feed.h"

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
// The same for programs that show that it is not there, and that it has come. The connections made,
// for whoever wants one more.
std::shared_ptr<tesk::Connector> connectWithoutWaiting(const LiveOptions& options, MainLoop& loop);

// Called before each wait with what is known so far; answers when it is to be called at the latest.
using LiveTurn = std::function<std::optional<MainLoop::Clock::time_point>(const History& history,
                                                                          const Feed& feed)>;
// Follows the service on that bus with a history until the program is told to end, and ends it.
[[noreturn]] void followService(const std::string& bus, const History::Limits& limits,
                                Output& output, const LiveTurn& turn);

}  // namespace qel::tools
