#include "sources/diagnostics/layouts/LteLayouts.h"

#include <algorithm>
#include <array>

#include "sources/diagnostics/layouts/LteSignalBlocks.h"

namespace qel::diagnostics {
namespace {

constexpr Scale kSigned{1, 0, true};

// The serving cell.
constexpr std::array kServingCell2 = {
    FieldRow{Field::pci, 1, 0, 16},      FieldRow{Field::earfcn, 3, 0, 16},
    FieldRow{Field::ulEarfcn, 5, 0, 16}, FieldRow{Field::dlBlocks, 7, 0, 8},
    FieldRow{Field::ulBlocks, 8, 0, 8},  FieldRow{Field::cellId, 9, 0, 32},
    FieldRow{Field::area, 13, 0, 16},    FieldRow{Field::band, 15, 0, 32},
    FieldRow{Field::mcc, 19, 0, 16},     FieldRow{Field::mncDigits, 21, 0, 8},
    FieldRow{Field::mnc, 22, 0, 16},
};
constexpr std::array kServingCell3 = {
    FieldRow{Field::pci, 1, 0, 16},      FieldRow{Field::earfcn, 3, 0, 32},
    FieldRow{Field::ulEarfcn, 7, 0, 32}, FieldRow{Field::dlBlocks, 11, 0, 8},
    FieldRow{Field::ulBlocks, 12, 0, 8}, FieldRow{Field::cellId, 13, 0, 32},
    FieldRow{Field::area, 17, 0, 16},    FieldRow{Field::band, 19, 0, 32},
    FieldRow{Field::mcc, 23, 0, 16},     FieldRow{Field::mncDigits, 25, 0, 8},
    FieldRow{Field::mnc, 26, 0, 16},
};

// A cell's broadcast of its bandwidth.
constexpr std::array kBroadcast1 = {
    FieldRow{Field::pci, 1, 0, 16},
    FieldRow{Field::earfcn, 3, 0, 16},
    FieldRow{Field::dlBlocks, 8, 0, 8},
};
constexpr std::array kBroadcast2 = {
    FieldRow{Field::pci, 1, 0, 16},
    FieldRow{Field::earfcn, 3, 0, 32},
    FieldRow{Field::dlBlocks, 10, 0, 8},
};

// A cell that was found.
constexpr std::array kFoundCell1 = {
    FieldRow{Field::dlBlocks, 1, 0, 8},
    FieldRow{Field::earfcn, 4, 0, 16},
    FieldRow{Field::pci, 6, 0, 9},
};
constexpr std::array kFoundCell2 = {
    FieldRow{Field::dlBlocks, 1, 0, 8},
    FieldRow{Field::earfcn, 4, 0, 32},
    FieldRow{Field::pci, 8, 0, 9},
};

// The serving cell's measurement: its heads, then its cells.
constexpr std::array kEarfcn16 = {FieldRow{Field::earfcn, 0, 0, 16}};
constexpr std::array kEarfcn32 = {FieldRow{Field::earfcn, 0, 0, 32}};
constexpr std::array kEarfcn32Count16 = kEarfcn32 + std::array{FieldRow{Field::count, 4, 0, 16}};
constexpr std::array kEarfcn32Count32 = kEarfcn32 + std::array{FieldRow{Field::count, 4, 0, 32}};

constexpr std::array kMeasured4 = kCellWord + behind(10, kLevelsA);
constexpr std::array kMeasured7 = kCellWord + behind(12, kLevelsA);
constexpr std::array kMeasured18 = kCellWordServing12 + behind(16, kLevelsA);
constexpr std::array kMeasured22 = kCellWordServing12 + kLevelsB;
constexpr std::array kMeasured35 = kCellWordServing12 + kLevelsC + behind(80, kSnrOfFour);
constexpr std::array kMeasured40 = kCellWordServing12 + kLevelsD + behind(84, kSnrOfFour);
constexpr std::array kMeasured48 = kCellWordServing12 + kLevelsD + behind(92, kSnrOfFour);
constexpr std::array kMeasured60 = kCellWordServing15 + kLevelsD;

// Neighbours, measured by the serving cell's rules.
constexpr std::array kListed3 = kEarfcn16 + std::array{FieldRow{Field::count, 2, 0, 6}};
constexpr std::array kListed4 = kEarfcn32 + std::array{FieldRow{Field::count, 4, 0, 6}};

// In connected mode: the serving cell and its neighbours on the same channel.
constexpr std::array kConnected3 = {
    FieldRow{Field::cellIndex, 4, 0, 3},     FieldRow{Field::earfcn, 8, 0, 16},
    FieldRow{Field::pci, 10, 0, 16},         FieldRow{Field::rsrp, 14, 0, 16, kRsrp},
    FieldRow{Field::rsrq, 18, 0, 16, kRsrq}, FieldRow{Field::count, 22, 0, 8},
};
constexpr std::array kConnected4 = {
    FieldRow{Field::cellIndex, 4, 0, 3},     FieldRow{Field::earfcn, 8, 0, 32},
    FieldRow{Field::pci, 12, 0, 16},         FieldRow{Field::rsrp, 16, 0, 16, kRsrp},
    FieldRow{Field::rsrq, 20, 0, 16, kRsrq}, FieldRow{Field::count, 24, 0, 8},
};
constexpr std::array kConnectedNeighbour = {
    FieldRow{Field::pci, 0, 0, 16},
    FieldRow{Field::rsrp, 2, 0, 16, kRsrp},
    FieldRow{Field::rsrq, 6, 0, 16, kRsrq},
};

// In idle mode: the serving cell alone, then its neighbours on the same channel.
constexpr std::array kIdleServing4 = {
    FieldRow{Field::earfcn, 4, 0, 16},        FieldRow{Field::pci, 6, 0, 9},
    FieldRow{Field::rsrp, 8, 0, 12, kRsrp},   FieldRow{Field::rsrq, 16, 0, 10, kRsrq},
    FieldRow{Field::rssi, 20, 10, 11, kRssi},
};
constexpr std::array kIdleServing5 = {
    FieldRow{Field::earfcn, 4, 0, 32},        FieldRow{Field::pci, 8, 0, 9},
    FieldRow{Field::rsrp, 12, 0, 12, kRsrp},  FieldRow{Field::rsrq, 20, 0, 10, kRsrq},
    FieldRow{Field::rssi, 24, 10, 11, kRssi},
};
constexpr std::array kIdleIntra4 = {
    FieldRow{Field::earfcn, 4, 0, 16},
    FieldRow{Field::count, 6, 6, 10},
};
constexpr std::array kIdleIntra5 = {
    FieldRow{Field::earfcn, 4, 0, 32},
    FieldRow{Field::count, 8, 6, 10},
};
constexpr std::array kIdleNeighbour = {
    FieldRow{Field::pci, 0, 0, 9},
    FieldRow{Field::rssi, 0, 9, 11, kRssi},
    FieldRow{Field::rsrp, 0, 20, 12, kRsrp},
    FieldRow{Field::rsrq, 8, 12, 10, kRsrq},
};

// What the phone sent: one record a subframe, powers in dBm.
constexpr std::array kTransmissions = {FieldRow{Field::count, 3, 0, 8}};
constexpr std::array kPusch4 = {
    FieldRow{Field::subframe, 0, 10, 4},
    FieldRow{Field::txPower, 8, 5, 8, kSigned},
};
constexpr std::array kPusch5 = {
    FieldRow{Field::subframe, 0, 10, 4},
    FieldRow{Field::txPower, 8, 15, 8, kSigned},
};
constexpr std::array kPusch25 = {
    FieldRow{Field::subframe, 0, 13, 4},
    FieldRow{Field::txPower, 8, 15, 8, kSigned},
};
constexpr std::array kPucch4 = {
    FieldRow{Field::subframe, 0, 10, 4},
    FieldRow{Field::txPower, 8, 16, 8, kSigned},
};

// code, part, version, least length, head; record, where the first is, bytes from one to the next
constexpr std::array kLayouts = {
    Layout{kLteBroadcastLog, 0, 1, 9, kBroadcast1},
    Layout{kLteBroadcastLog, 0, 2, 11, kBroadcast2},
    Layout{kLteBroadcastLog, 0, 3, 12, kBroadcast2},

    Layout{kLteServingCellLog, 0, 2, 25, kServingCell2},
    Layout{kLteServingCellLog, 0, 3, 29, kServingCell3},

    Layout{kLtePuschLog, 0, 4, 4, kTransmissions, kPusch4, 4, 12},
    Layout{kLtePuschLog, 0, 5, 4, kTransmissions, kPusch5, 4, 12},
    Layout{kLtePuschLog, 0, 25, 4, kTransmissions, kPusch25, 4, 12},

    Layout{kLtePucchLog, 0, 4, 4, kTransmissions, kPucch4, 4, 12},
    Layout{kLtePucchLog, 0, 24, 4, kTransmissions, kPucch4, 4, 12},

    Layout{kLteConnectedCellsLog, 0, 3, 24, kConnected3, kConnectedNeighbour, 24, 12},
    Layout{kLteConnectedCellsLog, 0, 4, 28, kConnected4, kConnectedNeighbour, 28, 12},

    Layout{kLteIdleServingLog, 0, 4, 32, kIdleServing4},
    Layout{kLteIdleServingLog, 0, 5, 36, kIdleServing5},

    Layout{kLteIdleIntraLog, 0, 4, 8, kIdleIntra4, kIdleNeighbour, 8, 32},
    Layout{kLteIdleIntraLog, 0, 5, 12, kIdleIntra5, kIdleNeighbour, 12, 32},

    Layout{kLteIdleNeighboursLog, 27, 3, 4, kListed3, kListedNeighbour, 4, 52},
    Layout{kLteIdleNeighboursLog, 27, 4, 8, kListed4, kListedNeighbour, 8, 52},
    Layout{kLteIdleNeighboursLog, 27, 24, 8, kListed4, kListedNeighbour, 8, 52},
    Layout{kLteIdleNeighboursLog, 27, 40, 8, kListed4, kListedNeighbour, 8, 52},

    Layout{kLteMeasurementLog, 25, 4, 2, kEarfcn16, kMeasured4, 2, 0},
    Layout{kLteMeasurementLog, 25, 7, 4, kEarfcn32, kMeasured7, 4, 0},
    Layout{kLteMeasurementLog, 25, 18, 4, kEarfcn32, kMeasured18, 4, 0},
    Layout{kLteMeasurementLog, 25, 19, 8, kEarfcn32Count16, kMeasured18, 8, 88},
    Layout{kLteMeasurementLog, 25, 22, 8, kEarfcn32Count16, kMeasured22, 8, 120},
    Layout{kLteMeasurementLog, 25, 24, 8, kEarfcn32Count16, kMeasured18, 8, 92},
    Layout{kLteMeasurementLog, 25, 35, 8, kEarfcn32Count16, kMeasured35, 8, 128},
    Layout{kLteMeasurementLog, 25, 36, 8, kEarfcn32Count16, kMeasured35, 8, 128},
    Layout{kLteMeasurementLog, 25, 40, 8, kEarfcn32Count16, kMeasured40, 8, 132},
    Layout{kLteMeasurementLog, 25, 48, 12, kEarfcn32Count16, kMeasured48, 12, 140},
    Layout{kLteMeasurementLog, 25, 50, 12, kEarfcn32Count16, kMeasured48, 12, 140},
    Layout{kLteMeasurementLog, 25, 60, 16, kEarfcn32Count32, kMeasured60, 16, 148},
    Layout{kLteMeasurementLog, 25, 66, 16, kEarfcn32Count32, kMeasured60, 16, 144},

    Layout{kLteConnectedNeighboursLog, 31, 3, 4, kListed3, kListedNeighbour, 4, 52},
    Layout{kLteConnectedNeighboursLog, 31, 4, 8, kListed4, kListedNeighbour, 8, 52},
    Layout{kLteConnectedNeighboursLog, 31, 24, 8, kListed4, kListedNeighbour, 8, 52},
    Layout{kLteConnectedNeighboursLog, 31, 40, 8, kListed4, kListedNeighbour, 8, 52},

    Layout{kLteFoundCellLog, 0, 1, 32, kFoundCell1},
    Layout{kLteFoundCellLog, 0, 2, 36, kFoundCell2},
};

constexpr bool isWhole(const Layout& row) {
  const bool headFits = bytesOf(row.head) <= row.bytes;
  const bool recordFits = row.recordBytes == 0 || bytesOf(row.record) <= row.recordBytes;
  return headFits && recordFits;
}
static_assert(std::all_of(kLayouts.begin(), kLayouts.end(), isWhole));

}  // namespace

std::span<const Layout> lteLayouts() { return kLayouts; }

}  // namespace qel::diagnostics
