// What a GSM cell says of itself in its system information.
#pragma once

#include <cstdint>
#include <optional>

namespace qel::diagnostics {

// Control channel description (44.018, clause 10.5.2.11).
struct GsmControlChannel {
  bool attach = false;
  std::uint32_t pagingMultiframes = 0;  // 2 to 9
  std::uint32_t t3212 = 0;              // tenths of an hour, 0: never

  friend bool operator==(const GsmControlChannel&, const GsmControlChannel&) = default;
};

// Cell options (44.018, clause 10.5.2.3).
struct GsmCellOptions {
  std::uint32_t discontinuousTransmission = 0;  // 0 to 2
  std::uint32_t radioLinkTimeout = 0;           // blocks, 4 to 64

  friend bool operator==(const GsmCellOptions&, const GsmCellOptions&) = default;
};

// Cell selection parameters (44.018, clause 10.5.2.4).
struct GsmSelection {
  std::optional<std::uint32_t> hysteresisDb;
  std::uint32_t mostPowerLevel = 0;
  std::uint32_t leastRxlev = 0;  // dBm + 110
  bool halfRate = false;

  friend bool operator==(const GsmSelection&, const GsmSelection&) = default;
};

// Control of random access (44.018, clause 10.5.2.29).
struct GsmAccess {
  std::uint32_t mostRepeats = 0;  // 1, 2, 4 or 7
  bool barred = false;
  bool reestablishment = false;
  std::uint32_t barredClasses = 0;  // 16 bits; bit 10: emergency calls

  bool emergencyCalls() const { return (barredClasses & 1U << 10) == 0; }

  friend bool operator==(const GsmAccess&, const GsmAccess&) = default;
};

// Parameters of the reselection criterion C2 (45.008, clause 6.4).
struct GsmReselection {
  bool given = false;
  std::optional<bool> qualify;
  std::optional<std::uint32_t> temporaryOffsetDb;  // nothing: without limit
  std::optional<std::uint32_t> penaltyS;

  friend bool operator==(const GsmReselection&, const GsmReselection&) = default;
};

// Packet service of the cell (44.018, clause 10.5.2.37b; 44.060, clause 12.24).
struct GsmPacketRules {
  std::uint32_t routingArea = 0;
  bool splitPaging = false;
  std::uint32_t priorityAccess = 0;            // 0 to 7
  std::uint32_t controlOrder = 0;              // 0 to 3
  std::optional<std::uint32_t> operationMode;  // 1 to 3
  std::optional<bool> extendedUplink;

  friend bool operator==(const GsmPacketRules&, const GsmPacketRules&) = default;
};

// Of one cell; what no message has said yet is absent.
struct GsmBroadcast {
  std::optional<GsmControlChannel> controlChannel;
  std::optional<GsmCellOptions> options;
  std::optional<GsmSelection> selection;
  std::optional<GsmAccess> access;
  std::optional<GsmReselection> reselection;
  std::optional<bool> earlyClassmark;
  std::optional<bool> secondList;     // system information 2ter
  std::optional<bool> moreSelection;  // system information 7 and 8
  std::optional<bool> cellBroadcast;
  std::optional<std::uint32_t> multibandReporting;  // 0 to 3
  std::optional<std::uint32_t> pageMode;            // 0 to 3
  std::optional<bool> packetService;
  std::optional<GsmPacketRules> packetRules;

  friend bool operator==(const GsmBroadcast&, const GsmBroadcast&) = default;
};

}  // namespace qel::diagnostics
