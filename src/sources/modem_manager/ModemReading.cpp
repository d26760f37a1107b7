#include "sources/modem_manager/ModemReading.h"

#include <algorithm>
#include <array>

#include "sources/modem_manager/BearerReadings.h"
#include "sources/modem_manager/CellReadings.h"
#include "sources/modem_manager/Names.h"
#include "sources/modem_manager/SimReadings.h"

namespace qel::sources {
namespace {

struct TechnologyBits {
  std::uint32_t bits;
  Technology technology;
  const char* signal;  // the property of Signal
  const char* level;
  std::optional<double> (*validLevel)(std::optional<double>);
  const char* quality;
  std::optional<double> (*validQuality)(std::optional<double>);
};

// The newest first: a phone on LTE may name older ones beside it.
constexpr std::array kTechnologies = {
    TechnologyBits{mm::kAnyLte, Technology::lte, "Lte", "rsrp", validRsrp, "rsrq", validRsrq},
    TechnologyBits{mm::kAnyUmts, Technology::umts, "Umts", "rscp", validRscp, "ecio", validEcno},
    TechnologyBits{mm::kAnyGsm, Technology::gsm, "Gsm", nullptr, nullptr, nullptr, nullptr},
};

const CellReading* servingAmong(const std::vector<CellReading>& cells,
                                std::optional<Technology> technology) {
  const auto found = std::ranges::find_if(cells, [&](const CellReading& cell) {
    return cell.serving && (!technology || cell.technology == *technology);
  });
  return found == cells.end() ? nullptr : &*found;
}

std::optional<Technology> technologyOf(std::uint32_t bits) {
  if (bits == mm::kAnyTechnology) return std::nullopt;  // says nothing
  const auto row = std::ranges::find_if(
      kTechnologies, [bits](const TechnologyBits& known) { return (bits & known.bits) != 0; });
  return row == kTechnologies.end() ? std::nullopt : std::optional(row->technology);
}

std::optional<Technology> technologyOf(const ModemAnswers& answers) {
  const CellReading* serving = answers.cells ? servingAmong(*answers.cells, {}) : nullptr;
  return serving ? std::optional(serving->technology) : std::nullopt;
}

template <class Type>
void fill(std::optional<Type>& value, const std::optional<Type>& other) {
  if (!value) value = other;
}

// Adds what another place knows of the cell, unless it speaks of another cell.
void complete(CellReading& cell, const CellReading& place) {
  const auto differs = [](const auto& a, const auto& b) { return a && b && *a != *b; };
  if (differs(cell.cellId, place.cellId) || differs(cell.area, place.area)) return;
  fill(cell.cellId, place.cellId);
  fill(cell.area, place.area);
  fill(cell.network, place.network);
}

void readCells(ModemPicture& picture, const ModemAnswers& answers) {
  const CellReading* serving = nullptr;
  if (answers.cells) {
    serving = servingAmong(*answers.cells, picture.technology);
    // With a serving cell of another technology the list is of before the phone moved. Modems that
    // list no cells of UMTS answer with an empty list there.
    picture.cellsKnown = (serving || !servingAmong(*answers.cells, {})) &&
                         !(answers.cells->empty() && picture.technology == Technology::umts);
  }
  if (picture.cellsKnown) {
    std::ranges::copy_if(*answers.cells, std::back_inserter(picture.neighbours),
                         [](const CellReading& cell) { return !cell.serving && !cell.secondary; });
  }
  if (!picture.technology) return;
  // Who tells the primary carrier tells the others too.
  if (serving && serving->primary && serving->technology == Technology::lte) {
    picture.carriers.emplace();
    std::ranges::copy_if(*answers.cells, std::back_inserter(*picture.carriers),
                         [](const CellReading& cell) {
                           return cell.secondary && cell.technology == Technology::lte;
                         });
  }
  CellReading cell = serving ? *serving : CellReading();
  cell.technology = *picture.technology;
  if (picture.network) {
    // Some modems' lists turn the digits of networks round: 310041 for 310410.
    if (cell.network && cell.network != picture.network) {
      for (CellReading& neighbour : picture.neighbours) neighbour.network.reset();
    }
    cell.network = picture.network;
  }
  if (const auto reading = placeReading(answers.place, *picture.technology)) {
    complete(cell, *reading);
  }
  if (cell.network || cell.area || cell.cellId || cell.channel || cell.code) picture.serving = cell;
}

void readLevels(ModemPicture& picture, const BusInterfaces& modem) {
  if (!picture.technology) return;
  const TechnologyBits& row =
      *std::ranges::find(kTechnologies, *picture.technology, &TechnologyBits::technology);
  const auto signal = busValue<BusProperties>(propertiesOf(modem, mm::kSignal), row.signal)
                          .value_or(BusProperties());
  picture.levels.rssiDbm = validRssi(busDouble(signal, "rssi"));
  picture.levels.snrDb = validSnr(busDouble(signal, "snr"));
  if (row.level) {
    picture.levels.levelDbm = row.validLevel(busDouble(signal, row.level));
    picture.levels.qualityDb = row.validQuality(busDouble(signal, row.quality));
  }
  if (!picture.serving) return;
  fill(picture.levels.levelDbm, picture.serving->levelDbm);
  fill(picture.levels.qualityDb, picture.serving->qualityDb);
}

// Nothing where the rejected technology has no metric.
void readRejection(ModemPicture& picture, const BusProperties& registered) {
  constexpr std::uint32_t kLargestCause = 111;  // 24.008, clause 10.5.3.6; 24.301, 9.9.3.9
  const auto rejection = busValue<BusProperties>(registered, "NetworkRejection");
  if (!rejection) return;
  const std::uint32_t cause = busUnsigned(*rejection, "error").value_or(0);
  if (cause == 0 || cause > kLargestCause) return;
  const std::uint32_t bits = busUnsigned(*rejection, "access-technology").value_or(0);
  const auto technology = technologyOf(bits);
  if (bits != 0 && !technology) return;
  picture.rejection = RejectionReading{cause, technology};
}

}  // namespace

ModemPicture pictureOf(const BusObjects& objects, const std::string& modem,
                       const ModemAnswers& answers) {
  const BusInterfaces& interfaces = objectAt(objects, modem);
  const BusProperties& own = propertiesOf(interfaces, mm::kModem);
  const BusProperties& registered = propertiesOf(interfaces, mm::kModem3gpp);
  ModemPicture picture;
  picture.registration = busUnsigned(registered, "RegistrationState");
  picture.packetService = busUnsigned(registered, "PacketServiceState");
  picture.network = networkCode(busValue<std::string>(registered, "OperatorCode").value_or(""));
  readRejection(picture, registered);
  picture.sim = simReading(propertiesOf(objectAt(objects, simPathOf(own)), mm::kSim));
  if (isEnabled(interfaces)) {
    picture.accessTechnologies = busUnsigned(own, "AccessTechnologies").value_or(0);
    picture.technology = technologyOf(picture.accessTechnologies);
    fill(picture.technology, technologyOf(answers));
    readCells(picture, answers);
    readLevels(picture, interfaces);
  }
  readBearers(picture, objects, interfaces);
  return picture;
}

std::optional<Technology> technologyIn(const BusInterfaces& modem) {
  return technologyOf(
      busUnsigned(propertiesOf(modem, mm::kModem), "AccessTechnologies").value_or(0));
}

bool tellsServingCell(const ModemAnswers& answers) {
  const CellReading* cell = answers.cells ? servingAmong(*answers.cells, {}) : nullptr;
  return cell && cell->area && cell->cellId;
}

bool isEnabled(const BusInterfaces& modem) {
  return busInteger(propertiesOf(modem, mm::kModem), "State").value_or(0) >= mm::kStateEnabled;
}

std::vector<ModemPart> partsOf(const BusInterfaces& modem) {
  const BusProperties& own = propertiesOf(modem, mm::kModem);
  std::vector<ModemPart> parts;
  if (const std::string sim = simPathOf(own); sim != mm::kNoObject)
    parts.push_back({sim, mm::kSim});
  for (const std::string& bearer : bearerPathsOf(modem)) parts.push_back({bearer, mm::kBearer});
  return parts;
}

bool tellsLevels(const BusInterfaces& modem) {
  ModemPicture picture;
  picture.technology = technologyIn(modem);
  readLevels(picture, modem);
  return picture.levels.rssiDbm || picture.levels.levelDbm;
}

std::string pushedPlaceIn(const BusInterfaces& modem) {
  const auto locations = busValue<std::map<std::uint32_t, sdbus::Variant>>(
      propertiesOf(modem, mm::kLocation), "Location");
  return locations ? placeIn(*locations) : "";
}

std::string placeIn(const std::map<std::uint32_t, sdbus::Variant>& locations) {
  const auto found = locations.find(mm::kPlaceOfCell);
  if (found == locations.end()) return "";
  return busValue<std::string>(found->second).value_or("");
}

}  // namespace qel::sources
