#include "service/bus/BusErrors.h"

#include <string>

namespace qel::service {
namespace {

sdbus::Error error(const char* name, const char* message) {
  return sdbus::Error(std::string("tesk.BasebandManager1.Error.") + name, message);
}

}  // namespace

sdbus::Error notRegistered() { return error("NotRegistered", "call Register first"); }
sdbus::Error invalidName() { return error("InvalidName", "the client name is empty"); }
sdbus::Error tooManyClients() { return error("TooManyClients", "too many clients"); }

}  // namespace qel::service
