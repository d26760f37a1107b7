#include "sources/diagnostics/requests/Request.h"

#include <algorithm>
#include <array>
#include <initializer_list>
#include <utility>

#include "base/FatalError.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kVersion = 0x00;
constexpr std::uint8_t kEvents = 0x60;
constexpr std::uint8_t kLogConfiguration = 0x73;
constexpr std::uint8_t kBuild = 0x7C;
constexpr std::uint8_t kMessageConfiguration = 0x7D;
constexpr std::uint8_t kEventMask = 0x82;

// No other command leaves this program.
constexpr std::array kAllowed = {
    kVersion, kEvents, kLogConfiguration, kBuild, kMessageConfiguration, kEventMask};

// Operations of kLogConfiguration.
constexpr std::uint32_t kDisable = 0;
constexpr std::uint32_t kRanges = 1;
constexpr std::uint32_t kSetMask = 3;
constexpr std::uint32_t kGetMask = 4;

constexpr std::size_t kOperationOffset = 4;
constexpr std::size_t kStatusOffset = 8;      // in an answer
constexpr std::size_t kEquipmentOffset = 12;  // in an answer; 8 in the request

// An answer of this first byte has the request, or its beginning, behind it.
constexpr std::array<std::uint8_t, 7> kRefusals = {
    0x13,  // bad command
    0x14,  // bad parameter
    0x15,  // bad length
    0x16,  // bad device
    0x18,  // bad mode
    0x42,  // needs the service programming code
    0x47,  // needs to be unlocked
};

void append(Bytes& bytes, std::initializer_list<std::uint32_t> words) {
  for (const std::uint32_t word : words) {
    for (unsigned shift = 0; shift < 32; shift += 8) {
      bytes.push_back(static_cast<std::uint8_t>(word >> shift & 0xFF));
    }
  }
}

void append(Bytes& bytes, ByteView more) { bytes.insert(bytes.end(), more.begin(), more.end()); }

// A router hands over the refusals of others' requests too: the command alone does not tell them
// apart where it has operations.
bool isRefusalOf(ByteView packet, ByteView request) {
  if (packet.size() < 2 || std::ranges::count(kRefusals, packet[0]) == 0) return false;
  const ByteView echo = packet.subspan(1);
  const std::size_t length = std::min(echo.size(), request.size());
  const std::size_t least = request[0] == kLogConfiguration ? kOperationOffset + 4 : 2;
  if (length < std::min(least, request.size())) return false;
  return std::ranges::equal(echo.first(length), request.first(length));
}

}  // namespace

Request::Request(std::string_view name, Kind kind, Bytes packet)
    : _name(name), _kind(kind), _packet(std::move(packet)) {
  if (std::ranges::count(kAllowed, _packet[0]) == 0) fatalError("a request that is not allowed");
}

Request Request::logConfiguration(std::string_view name, Kind kind, std::uint32_t operation,
                                  Bytes arguments) {
  Bytes packet{kLogConfiguration, 0, 0, 0};
  append(packet, {operation});
  append(packet, ByteView(arguments));
  return {name, kind, std::move(packet)};
}

Request Request::version() { return {"version", Kind::command, {kVersion}}; }

Request Request::build() { return {"build", Kind::command, {kBuild}}; }

Request Request::messagesOff() {
  constexpr std::uint8_t kSetAllMasks = 5;
  return {"messages off", Kind::command, {kMessageConfiguration, kSetAllMasks, 0, 0, 0, 0, 0, 0}};
}

Request Request::eventsOff() { return {"events off", Kind::command, {kEvents, 0}}; }

Request Request::eventsOn() { return {"events on", Kind::command, {kEvents, 1}}; }

Request Request::eventMask(ByteView bits) {
  const std::size_t count = 8 * bits.size();
  Bytes packet{kEventMask,
               0,
               0,
               0,
               static_cast<std::uint8_t>(count & 0xFF),
               static_cast<std::uint8_t>(count >> 8 & 0xFF)};
  append(packet, bits);
  return {"event mask", Kind::command, std::move(packet)};
}

Request Request::logsOff() {
  return logConfiguration("logs off", Kind::logConfiguration, kDisable, {});
}

Request Request::logRanges() {
  return logConfiguration("log ranges", Kind::logConfiguration, kRanges, {});
}

Request Request::setLogMask(const LogMask& mask) {
  Bytes arguments;
  append(arguments, {mask.equipment(), mask.items()});
  append(arguments, mask.bits());
  return logConfiguration("log mask", Kind::logConfigurationOfEquipment, kSetMask,
                          std::move(arguments));
}

Request Request::getLogMask(unsigned equipment) {
  Bytes arguments;
  append(arguments, {equipment});
  return logConfiguration("log mask as it is", Kind::logConfigurationOfEquipment, kGetMask,
                          std::move(arguments));
}

Request::Answer Request::answerIn(ByteView packet) const {
  if (isRefusalOf(packet, _packet)) return Answer::refused;
  if (!isOurs(packet)) return Answer::none;
  if (_kind == Kind::command) return Answer::good;
  return u32At(packet, kStatusOffset) == 0 ? Answer::good : Answer::refused;
}

bool Request::isOurs(ByteView answer) const {
  if (answer.empty() || answer[0] != _packet[0]) return false;
  if (_kind == Kind::command) return true;
  if (answer.size() < kStatusOffset + 4) return false;
  if (u32At(answer, kOperationOffset) != u32At(_packet, kOperationOffset)) return false;
  if (_kind == Kind::logConfiguration) return true;
  // A refusal need not name the equipment.
  if (answer.size() < kEquipmentOffset + 4) return u32At(answer, kStatusOffset) != 0;
  return u32At(answer, kEquipmentOffset) == u32At(_packet, kStatusOffset);
}

}  // namespace qel::diagnostics
