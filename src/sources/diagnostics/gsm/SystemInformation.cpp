#include "sources/diagnostics/gsm/SystemInformation.h"

#include <array>

#include "sources/diagnostics/gsm/RestOctets.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kHeaderBytes = 2;  // protocol discriminator, type
constexpr std::size_t kCellIdBytes = 2;

bool isNetwork(const LocationArea& area) { return networkOf(area.plmn).has_value(); }

GsmCell cellAt(ByteView message, std::size_t offset) {
  const std::uint32_t high = message[offset];
  return {locationAreaAt(message, offset + kCellIdBytes), high << 8 | message[offset + 1]};
}

GsmControlChannel controlChannelAt(ByteView message, std::size_t offset) {
  GsmControlChannel channel;
  channel.attach = (message[offset] & 0x40) != 0;
  channel.pagingMultiframes = (message[offset + 1] & 7U) + 2;
  channel.t3212 = message[offset + 2];
  return channel;
}

GsmCellOptions optionsAt(ByteView message, std::size_t offset) {
  return {message[offset] >> 4 & 3U, ((message[offset] & 0xFU) + 1) * 4};
}

GsmSelection selectionAt(ByteView message, std::size_t offset) {
  GsmSelection selection;
  selection.hysteresisDb = (message[offset] >> 5) * 2U;
  selection.mostPowerLevel = message[offset] & 0x1F;
  selection.halfRate = (message[offset + 1] & 0x40) != 0;
  selection.leastRxlev = message[offset + 1] & 0x3F;
  return selection;
}

GsmAccess accessAt(ByteView message, std::size_t offset) {
  constexpr std::array<std::uint32_t, 4> kRepeats = {1, 2, 4, 7};
  GsmAccess access;
  access.mostRepeats = kRepeats[message[offset] >> 6];
  access.barred = (message[offset] & 2) != 0;
  access.reestablishment = (message[offset] & 1) == 0;
  const std::uint32_t high = message[offset + 1];
  access.barredClasses = high << 8 | message[offset + 2];
  return access;
}

// Those of the criterion C2, behind which a power offset may stand (clauses 10.5.2.34 and 35).
GsmReselection readReselection(RestOctets& rest) {
  constexpr std::uint32_t kWithoutLimit = 7;
  constexpr std::uint32_t kOffsetIsNegative = 31;
  GsmReselection reselection;
  reselection.given = rest.high();
  if (reselection.given) {
    reselection.qualify = rest.bit();
    rest.skip(6);  // the offset itself
    const std::uint32_t temporary = rest.bits(3);
    const std::uint32_t penalty = rest.bits(5);
    if (penalty != kOffsetIsNegative) {
      if (temporary != kWithoutLimit) reselection.temporaryOffsetDb = temporary * 10;
      reselection.penaltyS = (penalty + 1) * 20;
    }
  }
  if (rest.high()) rest.skip(2);
  return reselection;
}

bool readPacketIndicator(RestOctets& rest) {
  const bool given = rest.high();
  if (given) rest.skip(4);  // colour, position of type 13
  return given;
}

// Each entry of a list says whether one more follows.
void skipList(RestOctets& rest, std::size_t entryBits) {
  do rest.skip(entryBits);
  while (rest.bit());
}

// 44.060, clause 12.10a.
void skipMobileAllocation(RestOctets& rest) {
  rest.skip(6);
  if (rest.bit()) skipList(rest, 4);
  if (!rest.bit()) {
    const std::size_t length = rest.bits(6) + 1;
    rest.skip(length);
  } else if (rest.bit()) {
    skipList(rest, 6);
  }
}

// 44.060, clause 12.24: the bit on extended uplink flows stands in an extension of stated length.
void readPacketOptions(RestOctets& rest, GsmPacketRules& rules) {
  constexpr std::uint32_t kModes = 3;
  const std::uint32_t mode = rest.bits(2);
  if (mode < kModes) rules.operationMode = mode + 1;
  rest.skip(3 + 3 + 3 + 1 + 1 + 4);
  if (rest.bit()) rest.skip(3 + 3 + 3);
  if (!rest.bit()) return;
  const std::size_t length = rest.bits(6) + 1;
  const std::size_t end = rest.position() + length;
  const std::size_t edgeBits = rest.bit() ? 5 : 0;
  const std::size_t before = 1 + edgeBits + 4;
  if (length <= before) return;
  rest.skip(before - 1);
  const bool extended = rest.bit();
  if (rest.failed() || end < rest.position()) return;
  rules.extendedUplink = extended;
}

}  // namespace

std::optional<SystemInformation3> readSystemInformation3(ByteView message) {
  constexpr std::size_t kCell = kHeaderBytes;
  constexpr std::size_t kControlChannel = kCell + kCellIdBytes + kLocationAreaBytes;
  constexpr std::size_t kOptions = kControlChannel + 3;
  constexpr std::size_t kSelection = kOptions + 1;
  constexpr std::size_t kAccess = kSelection + 2;
  constexpr std::size_t kRest = kAccess + 3;
  if (message.size() < kRest) return std::nullopt;
  SystemInformation3 read;
  read.cell = cellAt(message, kCell);
  if (!isNetwork(read.cell.area)) return std::nullopt;
  read.controlChannel = controlChannelAt(message, kControlChannel);
  read.options = optionsAt(message, kOptions);
  read.selection = selectionAt(message, kSelection);
  read.access = accessAt(message, kAccess);
  RestOctets rest(message.subspan(kRest));
  read.reselection = readReselection(rest);
  read.secondList = rest.high();
  read.earlyClassmark = rest.high();
  if (rest.high()) rest.skip(3);  // where types 7 and 8 are sent
  read.packetService = readPacketIndicator(rest);
  if (rest.failed()) return std::nullopt;
  return read;
}

std::optional<SystemInformation4> readSystemInformation4(ByteView message, std::size_t fixedBytes) {
  constexpr std::uint8_t kBroadcastChannel = 0x64;
  constexpr std::size_t kSelection = kHeaderBytes + kLocationAreaBytes;
  constexpr std::size_t kAccess = kSelection + 2;
  constexpr std::size_t kOptional = kAccess + 3;
  if (fixedBytes < kOptional || message.size() < fixedBytes) return std::nullopt;
  SystemInformation4 read;
  read.area = locationAreaAt(message, kHeaderBytes);
  if (!isNetwork(read.area)) return std::nullopt;
  read.selection = selectionAt(message, kSelection);
  read.access = accessAt(message, kAccess);
  read.moreSelection = (message[kSelection + 1] & 0x80) != 0;
  read.cellBroadcast = fixedBytes > kOptional && message[kOptional] == kBroadcastChannel;
  RestOctets rest(message.subspan(fixedBytes));
  const GsmReselection reselection = readReselection(rest);
  const bool packetService = readPacketIndicator(rest);
  if (rest.failed()) return std::nullopt;
  if (!read.moreSelection) {
    read.reselection = reselection;
    read.packetService = packetService;
  }
  return read;
}

std::optional<GsmCell> readSystemInformation6(ByteView message) {
  if (message.size() < kHeaderBytes + kCellIdBytes + kLocationAreaBytes) return std::nullopt;
  const GsmCell cell = cellAt(message, kHeaderBytes);
  return isNetwork(cell.area) ? std::optional(cell) : std::nullopt;
}

std::optional<std::uint32_t> readMultibandReporting(ByteView message) {
  constexpr std::size_t kListBytes = 16;
  if (message.size() < kHeaderBytes + kListBytes) return std::nullopt;
  return message[kHeaderBytes] >> 5 & 3U;
}

std::optional<SystemInformation13> readSystemInformation13(ByteView message) {
  if (message.size() <= kHeaderBytes) return std::nullopt;
  RestOctets rest(message.subspan(kHeaderBytes));
  SystemInformation13 read;
  if (!rest.high()) return read;
  rest.skip(3 + 4);
  if (rest.bit()) {
    rest.skip(2);
    skipMobileAllocation(rest);
  }
  if (rest.bit()) return rest.failed() ? std::nullopt : std::optional(read);
  GsmPacketRules rules;
  rules.routingArea = rest.bits(8);
  rules.splitPaging = rest.bit();
  rules.priorityAccess = rest.bits(3);
  rules.controlOrder = rest.bits(2);
  readPacketOptions(rest, rules);
  if (rest.failed()) return std::nullopt;
  read.rules = rules;
  return read;
}

}  // namespace qel::diagnostics
