// The D-Bus errors of the service.
#pragma once

#include <sdbus-c++/Error.h>

namespace qel::service {

// tesk.BasebandManager1.Error.NotRegistered: a call that only a registered client may make.
sdbus::Error notRegistered();
// tesk.BasebandManager1.Error.InvalidName: a client without a name.
sdbus::Error invalidName();
// tesk.BasebandManager1.Error.TooManyClients: the service is full.
sdbus::Error tooManyClients();

}  // namespace qel::service
