#include "tesk/bus/Reasons.h"

#include <algorithm>
#include <array>

namespace tesk::bus {
namespace {

struct Reason {
  std::string_view errorName;
  std::string_view words;
};

constexpr std::string_view kLimitsExceeded = "org.freedesktop.DBus.Error.LimitsExceeded";

constexpr std::array kReasons = {
    Reason{"org.freedesktop.DBus.Error.AccessDenied", kNoPermission},
    Reason{"tesk.BasebandManager1.Error.TooManyClients", kTooManyClients},
    Reason{kLimitsExceeded, kBusy},
    Reason{"tesk.BasebandManager1.Error.InvalidName", kRefused},
    Reason{"org.freedesktop.DBus.Error.Timeout", kNoAnswer},
    Reason{"org.freedesktop.DBus.Error.TimedOut", kNoAnswer},
    Reason{"org.freedesktop.DBus.Error.NoReply", kNoAnswer},
    Reason{"System.Error.ETIMEDOUT", kNoAnswer},
    Reason{"org.freedesktop.DBus.Error.UnknownMethod", kRefused},
    Reason{"org.freedesktop.DBus.Error.UnknownInterface", kRefused},
    Reason{"org.freedesktop.DBus.Error.UnknownObject", kRefused},
};

// What the bus says, or the service manager through it, when a service does not come up.
constexpr std::array kStartsOfFailedStarts = {"org.freedesktop.DBus.Error.Spawn.",
                                              "org.freedesktop.systemd1."};

bool isFailedStart(const std::string& errorName) {
  return std::ranges::any_of(kStartsOfFailedStarts,
                             [&](const char* start) { return errorName.starts_with(start); });
}

}  // namespace

std::string_view reasonOf(const sdbus::Error& error) {
  const auto found = std::ranges::find(kReasons, error.getName(), &Reason::errorName);
  if (found != kReasons.end()) return found->words;
  return isFailedStart(error.getName()) ? kNotStarted : kNotThere;
}

bool isNotRegistered(const sdbus::Error& error) {
  return error.getName() == "tesk.BasebandManager1.Error.NotRegistered";
}

bool isBusy(const sdbus::Error& error) { return error.getName() == kLimitsExceeded; }

bool isAbsence(const sdbus::Error& error) {
  return error.getName() == "org.freedesktop.DBus.Error.ServiceUnknown" ||
         error.getName() == "org.freedesktop.DBus.Error.NameHasNoOwner";
}

}  // namespace tesk::bus
