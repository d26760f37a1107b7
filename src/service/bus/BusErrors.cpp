#include "service/bus/BusErrors.h"

namespace qel::service {
namespace {

constexpr const char* kLimitsExceeded = "org.freedesktop.DBus.Error.LimitsExceeded";

sdbus::Error error(const char* name, const std::string& message) {
  return sdbus::Error(std::string("tesk.BasebandManager1.Error.") + name, message);
}

}  // namespace

sdbus::Error notRegistered() { return error("NotRegistered", "call Register first"); }
sdbus::Error invalidName(const std::string& fault) { return error("InvalidName", fault); }
sdbus::Error tooManyClients() { return error("TooManyClients", "too many clients"); }

sdbus::Error tooManyCalls() {
  return sdbus::Error(kLimitsExceeded, "too many calls of this caller are waiting");
}
sdbus::Error tooManyRegistrations() {
  return sdbus::Error(kLimitsExceeded, "this caller registers too often");
}

}  // namespace qel::service
