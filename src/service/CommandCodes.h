// The codes with which the service refuses a command. Each comes with a one-line message.
#pragma once

#include <cstdint>

namespace qel::service {

enum class CommandCode : std::uint32_t {
  done = 0,
  unknownCommand = 0xE020E010,
  missingKey = 0xE020E011,
  wrongType = 0xE020E012,
  unsupportedPayloadType = 0xE020E013,
  notAConfiguration = 0xE020E014,
  unknownMetric = 0xE020E015,
  metricNotAvailable = 0xE020E016,     // the source has no value of it now
  deliveryOff = 0xE020E017,            // nothing can be delivered to a client that has events off
  configurationTooLarge = 0xE020E018,  // its payload has too many bytes or entries
  tooManyConfigurations = 0xE020E019,  // no room for that of a further application
  requestTooLarge = 0xE020E01A,        // more or longer entries than any command takes
};

}  // namespace qel::service
