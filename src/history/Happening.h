// Something that happened, in words and with what it is about.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "history/Cell.h"

namespace qel {

enum class HappeningKind : std::uint8_t {
  cell,
  technology,
  rrc,
  radioLinkFailure,
  registration,
  reject,
  bearer,
  carrier,
  service,
  modem,
  gap,
  mark,
};

inline constexpr std::array kHappeningKinds = {
    HappeningKind::cell,         HappeningKind::technology,
    HappeningKind::rrc,          HappeningKind::radioLinkFailure,
    HappeningKind::registration, HappeningKind::reject,
    HappeningKind::bearer,       HappeningKind::carrier,
    HappeningKind::service,      HappeningKind::modem,
    HappeningKind::gap,          HappeningKind::mark,
};

// "cell", "technology", "rrc", "radio-link-failure", "registration", …
std::string_view nameOf(HappeningKind kind);
std::optional<HappeningKind> happeningKindNamed(std::string_view name);

// How a phone came from one cell to another of the same technology: as the network told it while
// they were connected, or by its own choice.
enum class CellMove : std::uint8_t { unknown, handover, reselection };

struct Happening {
  std::uint64_t timeMs = 0;  // of reception, since 1970-01-01 00:00 UTC
  HappeningKind kind = HappeningKind::cell;
  std::optional<Technology> technology;
  std::int64_t metric = 0;   // that told it, as events carry it; 0: none did
  std::string text;          // one line for a reader
  std::optional<Cell> from;  // of a cell change; none: nothing was known
  std::optional<Cell> to;
  CellMove move = CellMove::unknown;
};

}  // namespace qel
