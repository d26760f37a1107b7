// What is known of a modem at a moment, in plain values: made from the bus by ModemReading, turned
// into metrics by the reports.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "sources/simulated/Network.h"

namespace qel::sources {

// A member without value is one that the modem does not give, or whose value makes no sense.
// Levels are in dBm, qualities in dB.

// Country and network code (23.003, clause 2.2).
struct NetworkCode {
  std::uint32_t mcc = 0;
  std::uint32_t mnc = 0;
  std::uint32_t mncDigits = 2;
  friend bool operator==(const NetworkCode&, const NetworkCode&) = default;
};

struct CellReading {
  Technology technology = Technology::lte;
  bool serving = false;
  bool primary = false;    // serving, and said to be the primary one of several carriers
  bool secondary = false;  // another carrier, which is no neighbour
  std::optional<NetworkCode> network;
  std::optional<std::uint32_t> area;           // tracking or location area code
  std::optional<std::uint32_t> cellId;         // 28 bits, for GSM 16
  std::optional<std::uint32_t> channel;        // EARFCN, UARFCN or ARFCN, downlink
  std::optional<std::uint32_t> code;           // physical cell identity, scrambling code or BSIC
  std::optional<double> levelDbm;              // RSRP, RSCP or RXLEV
  std::optional<double> qualityDb;             // RSRQ or Ec/No
  std::optional<std::uint32_t> bandwidthCode;  // of LTE, 0 to 5 for 1.4 to 20 MHz
};

// Why the network refused to register the phone, by the number that it sent.
struct RejectionReading {
  std::uint32_t cause = 0;
  std::optional<Technology> technology;
};

// Of the serving cell.
struct LevelReading {
  std::optional<double> rssiDbm;
  std::optional<double> levelDbm;   // RSRP or RSCP
  std::optional<double> qualityDb;  // RSRQ or Ec/No
  std::optional<double> snrDb;
};

// A packet connection that is up.
struct BearerReading {
  std::uint32_t profile = 0;  // 0: not known
  std::string apn;
  bool uses4 = false;  // carries IPv4; its address may be told over the connection alone
  bool uses6 = false;
  Bytes address4;  // in network byte order, as the following; empty: none
  Bytes address6;
  std::vector<Bytes> nameServers;  // IPv4 first
  friend bool operator==(const BearerReading&, const BearerReading&) = default;
};

// What is known of the card; digits, or nothing.
struct SimReading {
  std::string imsi;
  std::string iccid;
  std::string network;       // the home network's code
  std::string providerName;  // UTF-8
  std::vector<std::string> emergencyNumbers;
};

struct ModemPicture {
  std::optional<Technology> technology;        // of the serving cell
  std::uint32_t accessTechnologies = 0;        // as the modem gives them, a bit each
  std::optional<std::uint32_t> registration;   // as the modem numbers it
  std::optional<std::uint32_t> packetService;  // likewise
  std::optional<NetworkCode> network;          // the registered one
  std::optional<RejectionReading> rejection;   // the last one
  std::optional<CellReading> serving;          // from every place that tells of it
  LevelReading levels;
  bool cellsKnown = false;                            // the modem lists cells
  std::vector<CellReading> neighbours;                // of all technologies
  std::optional<std::vector<CellReading>> carriers;   // the secondary ones of LTE
  std::optional<std::vector<BearerReading>> bearers;  // those that are connected
  bool bearersUnread = false;                         // there are others that refuse to be read
  SimReading sim;
};

}  // namespace qel::sources
