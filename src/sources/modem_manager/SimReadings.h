// The card of a modem.
#pragma once

#include <string>

#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// The object of the card in use, from the properties of Modem; "/" when there is none.
std::string simPathOf(const BusProperties& modem);

// From the properties of Sim.
SimReading simReading(const BusProperties& sim);

}  // namespace qel::sources
