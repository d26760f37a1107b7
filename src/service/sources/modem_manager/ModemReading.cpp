#include "service/sources/modem_manager/ModemReading.h"

#include <arpa/inet.h>

#include <algorithm>
#include <array>

#include "service/sources/modem_manager/CellReadings.h"
#include "service/sources/modem_manager/Names.h"

namespace qel::service {
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

const BusInterfaces& objectAt(const BusObjects& objects, const std::string& path) {
  static const BusInterfaces kNone;
  const auto found = objects.find(path);
  return found == objects.end() ? kNone : found->second;
}

std::string digitsOnly(std::string text) {
  // A filler at the end is how some cards' digits come.
  while (!text.empty() && (text.back() == 'F' || text.back() == 'f')) text.pop_back();
  const bool digits = std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
  return digits ? text : std::string();
}

std::string digitsOf(const BusProperties& properties, const char* key, std::size_t fewest,
                     std::size_t most) {
  std::string digits = digitsOnly(busValue<std::string>(properties, key).value_or(""));
  return digits.size() >= fewest && digits.size() <= most ? digits : std::string();
}

Bytes addressOf(const BusProperties& configuration, const char* key, int family) {
  std::array<std::uint8_t, 16> address{};
  const std::string text = busValue<std::string>(configuration, key).value_or("");
  if (::inet_pton(family, text.c_str(), address.data()) != 1) return {};
  // 0.0.0.0 and :: are no addresses (RFC 1122, 3.2.1.3; RFC 4291, 2.5.2).
  if (std::ranges::count(address, 0) == std::ssize(address)) return {};
  const std::ptrdiff_t size = family == AF_INET ? 4 : 16;
  return {address.begin(), address.begin() + size};
}

struct AddressKind {
  const char* property;
  int family;
  Bytes BearerReading::*address;
  bool BearerReading::*inUse;
};
constexpr std::array kAddressKinds = {
    AddressKind{"Ip4Config", AF_INET, &BearerReading::address4, &BearerReading::uses4},
    AddressKind{"Ip6Config", AF_INET6, &BearerReading::address6, &BearerReading::uses6},
};

// Nothing unless it is connected.
std::optional<BearerReading> bearerReading(const BusProperties& bearer) {
  if (!busValue<bool>(bearer, "Connected").value_or(false)) return std::nullopt;
  BearerReading reading;
  const auto asked = busValue<BusProperties>(bearer, "Properties").value_or(BusProperties());
  reading.apn = busValue<std::string>(asked, "apn").value_or("");
  reading.profile = busUnsigned(bearer, "ProfileId").value_or(0);
  if (reading.profile == 0) reading.profile = busUnsigned(asked, "profile-id").value_or(0);
  for (const AddressKind& kind : kAddressKinds) {
    const auto configuration = busValue<BusProperties>(bearer, kind.property);
    if (!configuration) continue;
    reading.*kind.address = addressOf(*configuration, "address", kind.family);
    reading.*kind.inUse =
        !(reading.*kind.address).empty() || busUnsigned(*configuration, "method").value_or(0) != 0;
    for (const char* key : {"dns1", "dns2", "dns3"}) {
      if (Bytes server = addressOf(*configuration, key, kind.family); !server.empty()) {
        reading.nameServers.push_back(std::move(server));
      }
    }
  }
  return reading;
}

// Nothing until all of them have been asked for.
void readBearers(ModemPicture& picture, const BusObjects& objects, const BusInterfaces& modem) {
  const auto paths =
      busValue<std::vector<sdbus::ObjectPath>>(propertiesOf(modem, mm::kModem), "Bearers");
  if (!paths) return;
  std::vector<BearerReading> bearers;
  for (const std::string& path : *paths) {
    const BusInterfaces& object = objectAt(objects, path);
    if (!object.contains(mm::kBearer)) return;
    const BusProperties& properties = propertiesOf(object, mm::kBearer);
    if (!busValue<bool>(properties, "Connected")) picture.bearersUnread = true;
    if (auto bearer = bearerReading(properties)) bearers.push_back(std::move(*bearer));
  }
  picture.bearers = std::move(bearers);
}

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
                         [](const CellReading& cell) { return !cell.serving; });
  }
  if (!picture.technology) return;
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
  readBearers(picture, objects, interfaces);
  const auto simPath = busValue<sdbus::ObjectPath>(own, "Sim").value_or(mm::kNoObject);
  const BusProperties& sim = propertiesOf(objectAt(objects, simPath), mm::kSim);
  picture.imsi = digitsOf(sim, "Imsi", 6, 15);             // 23.003, clause 2.2
  picture.iccid = digitsOf(sim, "SimIdentifier", 18, 20);  // ITU-T E.118
  if (isEnabled(interfaces)) {
    picture.accessTechnologies = busUnsigned(own, "AccessTechnologies").value_or(0);
    picture.technology = technologyOf(picture.accessTechnologies);
    fill(picture.technology, technologyOf(answers));
    readCells(picture, answers);
    readLevels(picture, interfaces);
  }
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
  const auto sim = busValue<sdbus::ObjectPath>(own, "Sim");
  if (sim && *sim != mm::kNoObject) parts.push_back({*sim, mm::kSim});
  for (const std::string& bearer : busValue<std::vector<sdbus::ObjectPath>>(own, "Bearers")
                                       .value_or(std::vector<sdbus::ObjectPath>())) {
    if (bearer != mm::kNoObject) parts.push_back({bearer, mm::kBearer});
  }
  return parts;
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

}  // namespace qel::service
