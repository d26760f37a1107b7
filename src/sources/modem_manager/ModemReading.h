// A modem's objects on the bus into one picture of it.
#pragma once

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// What methods have answered, beside the properties.
struct ModemAnswers {
  std::optional<std::vector<CellReading>> cells;  // none: GetCellInfo is not to be had
  std::string place;                              // of the serving cell; may be empty
};

// Whether the list of cells says where the serving one is.
bool tellsServingCell(const ModemAnswers& answers);

// `modem` is a path in `objects`, where its SIM and bearers are too once they have been read.
ModemPicture pictureOf(const BusObjects& objects, const std::string& modem,
                       const ModemAnswers& answers);

// The technology in use, as far as the modem names it.
std::optional<Technology> technologyIn(const BusInterfaces& modem);

// Enabled, so that its radio works.
bool isEnabled(const BusInterfaces& modem);

// The SIM and the bearers that the modem names.
struct ModemPart {
  std::string path;
  const char* interface;
};
std::vector<ModemPart> partsOf(const BusInterfaces& modem);

// Whether its signal has a level, in the technology in use.
bool tellsLevels(const BusInterfaces& modem);

// The place of the serving cell in a dictionary of locations; empty when it is not in there.
std::string placeIn(const std::map<std::uint32_t, sdbus::Variant>& locations);
// The one that comes with the properties.
std::string pushedPlaceIn(const BusInterfaces& modem);

}  // namespace qel::sources
