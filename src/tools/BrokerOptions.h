// Options that name a broker, and what is shown to it.
#pragma once

#include <string>

#include "fleet/BrokerLink.h"

namespace CLI {
class App;
}

namespace qel::tools {

struct BrokerOptions {
  std::string url;
  std::string loginFile;
  fleet::LinkSettings link;  // the broker and the names of files
};

// URL, --login, --ca, --cert and --key. `certificate` says whose that is.
void addBrokerOptions(CLI::App& command, BrokerOptions& options, const std::string& certificate);
// Once they are read: finds the broker. Throws CLI::ValidationError when it cannot be.
void checkBrokerOptions(BrokerOptions& options);
// With what stands in the files. Throws a ToolError.
fleet::LinkSettings linkSettingsOf(const BrokerOptions& options);

}  // namespace qel::tools
