// Reads what a GSM cell broadcasts (44.018, clauses 9.1.32 to 9.1.43a).
#pragma once

#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/GsmPicture.h"

namespace qel::diagnostics {

// Each reader takes a message from its protocol discriminator on, and gives nothing when it is
// shorter than its fixed part or a network code has digits that are none.

struct SystemInformation3 {
  GsmCell cell;
  GsmControlChannel controlChannel;
  GsmCellOptions options;
  GsmSelection selection;
  GsmAccess access;
  GsmReselection reselection;
  bool secondList = false;
  bool earlyClassmark = false;
  bool packetService = false;
};
std::optional<SystemInformation3> readSystemInformation3(ByteView message);

struct SystemInformation4 {
  LocationArea area;
  GsmSelection selection;
  GsmAccess access;
  bool cellBroadcast = false;
  bool moreSelection = false;
  // Nothing where types 7 and 8 have them.
  std::optional<GsmReselection> reselection;
  std::optional<bool> packetService;
};
// `fixedBytes`: how long the message is without its rest octets.
std::optional<SystemInformation4> readSystemInformation4(ByteView message, std::size_t fixedBytes);

// The cell, while the phone has a channel of its own.
std::optional<GsmCell> readSystemInformation6(ByteView message);

// 0 to 3, of system information 2ter and 5ter.
std::optional<std::uint32_t> readMultibandReporting(ByteView message);

// With nothing in `rules` where the cell has a packet control channel that tells them.
struct SystemInformation13 {
  std::optional<GsmPacketRules> rules;
};
std::optional<SystemInformation13> readSystemInformation13(ByteView message);

}  // namespace qel::diagnostics
