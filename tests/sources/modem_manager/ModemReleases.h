// A modem as the releases of ModemManager from 1.18 to 1.24 show it.
#pragma once

#include <array>

#include "sources/modem_manager/ModemWorld.h"

namespace qel::testing {

inline constexpr std::array kReleases = {18, 20, 22, 24};

inline const std::string kInitialBearerPath = "/org/freedesktop/ModemManager1/Bearer/99";

// The interfaces of 1.`minor`, on LTE and registered.
inline FakeInterfaces modemOfRelease(int minor, std::uint32_t technologies = kOnLte) {
  auto modem = modemOn(technologies);
  modem.at(kModem).emplace("SimSlots", std::vector<sdbus::ObjectPath>());
  modem.at(kModem).emplace("PrimarySimSlot", std::uint32_t{0});
  modem.at(kModem3gpp).emplace("InitialEpsBearer", sdbus::ObjectPath("/"));
  modem.at(kModem3gpp).emplace("InitialEpsBearerSettings", FakeDictionary());
  if (minor < 20) modem.at(kModem3gpp).erase("PacketServiceState");
  if (minor >= 20) {
    modem.at(kSignal).emplace("RssiThreshold", std::uint32_t{0});
    modem.at(kSignal).emplace("ErrorRateThreshold", false);
  }
  if (minor >= 24) modem.at(kModem3gpp).emplace("NetworkRejection", FakeDictionary());
  return modem;
}

// The primary carrier, a secondary one and a neighbour, as 1.`minor` lists them.
inline std::vector<FakeDictionary> cellsOfRelease(int minor) {
  std::vector<FakeDictionary> cells = {{{"cell-type", number(5)},
                                        {"serving", flag(true)},
                                        {"physical-ci", text("7")},
                                        {"earfcn", number(1300)},
                                        {"rsrp", level(-95)}},
                                       {{"cell-type", number(5)},
                                        {"serving", flag(false)},
                                        {"physical-ci", text("8")},
                                        {"earfcn", number(1300)}}};
  if (minor >= 22) {
    cells[0]["serving-cell-type"] = number(1);
    cells[0]["bandwidth"] = number(20000000);
    cells.push_back({{"cell-type", number(5)},
                     {"serving", flag(true)},
                     {"serving-cell-type", number(2)},
                     {"physical-ci", text("9")},
                     {"earfcn", number(6300)},
                     {"bandwidth", number(10000000)},
                     {"rsrp", level(-98.5)},
                     {"rsrq", level(-11)}});
  }
  return cells;
}

// Puts that modem in, and takes away the methods that the release does not have.
inline void speakAs(int minor, FakeModemManager& manager, FakeInterfaces modem) {
  if (minor < 20) {
    manager.answer("GetCellInfo",
                   {FakeAnswer::Kind::error, "org.freedesktop.DBus.Error.UnknownMethod"});
    manager.answer("SetupThresholds",
                   {FakeAnswer::Kind::error, "org.freedesktop.DBus.Error.UnknownMethod"});
  }
  manager.setCells(cellsOfRelease(minor));
  manager.add(kModemPath, std::move(modem));
}

}  // namespace qel::testing
