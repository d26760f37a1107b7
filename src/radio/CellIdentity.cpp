#include "radio/CellIdentity.h"

namespace qel {
namespace {

constexpr std::uint32_t kHighest28Bits = 0xFFFFFFF;

std::string parts(std::uint32_t first, std::uint32_t second) {
  return std::to_string(first) + "·" + std::to_string(second);
}

}  // namespace

std::optional<LteCellIdentity> lteCellIdentity(std::uint32_t eci) {
  if (eci > kHighest28Bits) return std::nullopt;
  return LteCellIdentity{eci >> 8, eci & 0xFF};
}

std::optional<UmtsCellIdentity> umtsCellIdentity(std::uint32_t cellId) {
  if (cellId > kHighest28Bits) return std::nullopt;
  return UmtsCellIdentity{cellId >> 16, cellId & 0xFFFF};
}

std::optional<StationCode> stationCode(std::uint32_t bsic) {
  constexpr std::uint32_t kHighest = 63;
  if (bsic > kHighest) return std::nullopt;
  return StationCode{bsic >> 3, bsic & 7};
}

std::string cellIdText(Technology technology, std::uint32_t cellId) {
  if (technology == Technology::lte) {
    if (const auto cell = lteCellIdentity(cellId)) return parts(cell->eNodeB, cell->sector);
  }
  if (technology == Technology::umts) {
    if (const auto cell = umtsCellIdentity(cellId)) return parts(cell->rnc, cell->cell);
  }
  return std::to_string(cellId);
}

}  // namespace qel
