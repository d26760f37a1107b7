// What is known of the connection to LTE's network (36.331).
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "rrc/lte/Connection.h"
#include "sources/diagnostics/picture/LteCells.h"

namespace qel::diagnostics {

// Where the connection stands. Codes are those of the report on it (19972).
struct LteRrcState {
  static constexpr std::int32_t kConnected = 3;

  std::optional<std::int32_t> state;
  std::uint64_t sinceMs = 0;
  std::optional<std::int32_t> previous;
  std::optional<std::uint32_t> previousMs;  // how long it had lasted
  std::optional<std::int32_t> cause;

  bool modemTells = false;  // its events do; else the state follows from messages

  struct Announced {
    std::int32_t cause = 0;
    std::uint64_t timeMs = 0;
  };
  std::optional<Announced> announced;  // by a message, for the state that the modem will tell
};

// The latest loss of the connection; its cause is one of the state's.
struct LteLinkFailure {
  std::uint64_t timeMs = 0;
  std::optional<std::int32_t> cause;
};

// What the connection's configuration says of receiving.
struct LteReception {
  bool configured = false;           // it has said something of what follows
  std::optional<rrc::lte::Drx> drx;  // absent: switched off
  std::optional<std::uint32_t> transmissionMode;
};

// What the phone is to measure: objects, and the identities under which it reports on them.
struct LteMeasuring {
  static constexpr std::size_t kIdentities = 33;  // 1 to 32

  std::array<std::optional<rrc::lte::MeasurementObject>, kIdentities> objects{};
  std::array<std::optional<unsigned>, kIdentities> objectOf{};
};

// A cell of another technology that the phone reported on.
struct LteOther {
  enum class Kind : std::uint8_t { umts, gsm };

  Kind kind = Kind::umts;
  std::optional<std::uint32_t> channel;
  std::uint32_t code = 0;             // primary scrambling code, or BSIC
  std::optional<std::int32_t> level;  // as reported: RSCP or RXLEV
  std::optional<std::uint32_t> ecn0;  // as reported
  std::uint64_t timeMs = 0;
};

// The latest of every cell. At kMost the oldest makes room.
struct LteOthers {
  static constexpr std::size_t kMost = 64;

  std::vector<LteOther> cells;
};

struct LteConnection {
  LteRrcState rrc;
  std::optional<LteLinkFailure> failure;
  LteReception reception;
  LteMeasuring measuring;
  LteOthers others;
  std::uint64_t configuredMs = 0;  // when the network last configured it
};

}  // namespace qel::diagnostics
