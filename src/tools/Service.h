// The baseband manager service, for the subcommands that need it.
#pragma once

#include <functional>
#include <string>

#include "base/Bytes.h"
#include "tesk/bus/BusConnector.h"

namespace CLI {
class App;
}

namespace qel::tools {

// --bus.
void addBusOption(CLI::App& command, std::string& bus);

// Waits up to two seconds for the service. A ToolError when it is not there then.
void requireService(const std::string& bus);
[[noreturn]] void failWithoutService(const std::string& why);

// Says on the main queue, through `say`, that the service was lost or cannot be had, each time with
// the reason, and that it is there; then calls `back`.
tesk::bus::ReachabilityObserver serviceObserver(std::function<void(const std::string&)> say,
                                                std::function<void()> back);

// Makes the files that the program is shipped with the resources of the process.
void findResources();

// The configuration that asks for every metric: the name of its file. A ToolError when it is not
// there.
std::string configurationFile();
// And what stands in it; empty when that is more than a configuration can be.
Bytes configuration();

}  // namespace qel::tools
