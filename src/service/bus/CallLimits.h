// Looks at the arguments of a call before anything is made of them.
#pragma once

#include <sdbus-c++/Message.h>

#include <optional>
#include <string>

#include "tesk/Transport.h"

namespace qel::service {

// A message of the bus may have megabytes, and its values take many times that once they are
// unpacked. Each leaves the call as it was, to be read from its beginning.

// What is wrong with the client name of a Register, in one line; empty: nothing.
std::string faultOfRegister(sdbus::MethodCall& call);

// The answer to a PerformCommand with more or longer values than any command takes, or with values
// of types that none takes.
std::optional<tesk::CommandResult> refusedRequest(sdbus::MethodCall& call);

}  // namespace qel::service
