// The layouts of LTE's log packets.
#pragma once

#include <cstdint>
#include <span>

#include "sources/diagnostics/layouts/Layout.h"

namespace qel::diagnostics {

inline constexpr std::uint16_t kLteServingCellLog = 0xB0C2;
inline constexpr std::uint16_t kLteBroadcastLog = 0xB0C1;
inline constexpr std::uint16_t kLteFoundCellLog = 0xB197;
inline constexpr std::uint16_t kLteMeasurementLog = 0xB193;
inline constexpr std::uint16_t kLteIdleNeighboursLog = 0xB192;
inline constexpr std::uint16_t kLteConnectedNeighboursLog = 0xB195;
inline constexpr std::uint16_t kLteConnectedCellsLog = 0xB179;
inline constexpr std::uint16_t kLteIdleServingLog = 0xB17F;
inline constexpr std::uint16_t kLteIdleIntraLog = 0xB180;
inline constexpr std::uint16_t kLtePuschLog = 0xB16E;
inline constexpr std::uint16_t kLtePucchLog = 0xB16F;

// Those of one code and part stand together, by ascending version.
std::span<const Layout> lteLayouts();

}  // namespace qel::diagnostics
