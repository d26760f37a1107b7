// The packet connections of a modem.
#pragma once

#include <string>
#include <vector>

#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// The objects that are to be read: the connections that programs have asked for, at most 32 of
// them, and the first one of LTE.
std::vector<std::string> bearerPathsOf(const BusInterfaces& modem);

// None before all of them have been asked for. Of the first connection of LTE only while the
// picture is of LTE.
void readBearers(ModemPicture& picture, const BusObjects& objects, const BusInterfaces& modem);

}  // namespace qel::sources
