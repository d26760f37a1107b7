// The D-Bus errors of the service.
#pragma once

#include <sdbus-c++/Error.h>

#include <string>

namespace qel::service {

// tesk.BasebandManager1.Error.NotRegistered: a call that only a registered client may make.
sdbus::Error notRegistered();
// tesk.BasebandManager1.Error.InvalidName: a client name that is not taken, and why.
sdbus::Error invalidName(const std::string& fault);
// tesk.BasebandManager1.Error.TooManyClients: the service is full.
sdbus::Error tooManyClients();
// org.freedesktop.DBus.Error.LimitsExceeded: the caller has too many calls waiting, or registers
// too often.
sdbus::Error tooManyCalls();
sdbus::Error tooManyRegistrations();

}  // namespace qel::service
