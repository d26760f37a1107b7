// Why the service cannot be had, each reason in one line of its own.
#pragma once

#include <sdbus-c++/Error.h>
#include <string>
#include <string_view>

namespace tesk::bus {

// What every reason but kNoBus begins with.
inline constexpr std::string_view kTheService = "baseband manager service ";

inline constexpr std::string_view kNoBus = "no message bus";
inline constexpr std::string_view kNotThere = "baseband manager service not reachable";
// The bus knows how to start it, and could not.
inline constexpr std::string_view kNotStarted =
    "baseband manager service not running and could not be started";
inline constexpr std::string_view kNoPermission =
    "no permission to use the baseband manager service (is the user in group baseband?)";
inline constexpr std::string_view kTooManyClients = "baseband manager service has too many clients";
inline constexpr std::string_view kNoAnswer = "baseband manager service does not answer";
inline constexpr std::string_view kBusy = "baseband manager service is busy";
inline constexpr std::string_view kRefused = "baseband manager service refuses this client";

// The reason behind an error of a call to the service.
std::string_view reasonOf(const sdbus::Error& error);

// Whether the error says that the service does not know the caller (any more).
bool isNotRegistered(const sdbus::Error& error);

// Whether the call was not taken and may be made again after a while.
bool isBusy(const sdbus::Error& error);

// Whether nothing but the service's appearance can change that: asking again is of no use.
bool isAbsence(const sdbus::Error& error);

}  // namespace tesk::bus
