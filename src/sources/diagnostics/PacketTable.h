// The rows by which packets are read and metrics are built.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "base/Bytes.h"
#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// Takes what the packet tells into the picture: the whole of it, or nothing.
using ReadLog = Outcome (*)(const LogPacket& packet, Picture& picture, Told& told);
using ReadEvent = Outcome (*)(const ModemEvent& event, Picture& picture, Told& told);

// The number by which a modem tells one layout of a log from another.
using VersionOf = std::optional<unsigned> (*)(ByteView body);

inline std::optional<unsigned> versionInFirstByte(ByteView body) {
  return body.empty() ? std::nullopt : std::optional<unsigned>(body[0]);
}

struct LogRow {
  std::uint16_t code;
  std::string_view name;
  ReadLog read;
  VersionOf version;  // null: it has none
};

struct EventRow {
  std::uint16_t id;
  std::string_view name;
  ReadEvent read;
};

// A metric's payload with that time stamp; nothing when the port has told nothing of it.
using BuildReport = std::optional<Bytes> (*)(const Picture& picture, std::uint64_t timeMs);

struct ReportRow {
  std::uint32_t metric;  // 16 bits
  BuildReport build;
};

// Of all technologies; null when nobody reads it.
const LogRow* findLog(std::uint16_t code);
const EventRow* findEvent(std::uint16_t id);
const ReportRow* findReport(std::uint32_t metric);

}  // namespace qel::diagnostics
