// How a cell's levels are packed in the measurement logs of LTE. Offsets from the word with the
// cell's number.
#pragma once

#include <array>

#include "sources/diagnostics/layouts/FieldBlocks.h"

namespace qel::diagnostics {

inline constexpr Scale kRsrp{1.0 / 16, -180};        // dBm
inline constexpr Scale kRsrpLess40{1.0 / 16, -140};  // dBm; where the modem writes 40 dB less
inline constexpr Scale kRsrq{1.0 / 16, -30};         // dB
inline constexpr Scale kRssi{1.0 / 16, -110};        // dBm
inline constexpr Scale kSnr{1.0 / 10, -20};          // dB

// The word with the cell's number.
inline constexpr std::array kCellWord = {
    FieldRow{Field::pci, 0, 0, 9},
    FieldRow{Field::cellIndex, 0, 9, 3},
};
inline constexpr std::array kCellWordServing12 =
    kCellWord + std::array{FieldRow{Field::isServing, 0, 12, 1}};
inline constexpr std::array kCellWordServing15 =
    kCellWord + std::array{FieldRow{Field::isServing, 0, 15, 1}};

// Two antennas; it begins at another place in each version.
inline constexpr std::array kLevelsA = {
    FieldRow{Field::rsrp0, 0, 10, 12, kRsrp},  FieldRow{Field::rsrp1, 4, 12, 12, kRsrp},
    FieldRow{Field::rsrp, 8, 12, 12, kRsrp},   FieldRow{Field::rsrq0, 12, 12, 10, kRsrq},
    FieldRow{Field::rsrq1, 16, 0, 10, kRsrq},  FieldRow{Field::rsrq, 16, 20, 10, kRsrq},
    FieldRow{Field::rssi0, 20, 10, 11, kRssi}, FieldRow{Field::rssi1, 20, 21, 11, kRssi},
    FieldRow{Field::rssi, 24, 0, 11, kRssi},   FieldRow{Field::snr0, 48, 0, 9, kSnr},
    FieldRow{Field::snr1, 48, 9, 9, kSnr},
};

inline constexpr std::array kLevelsB = {
    FieldRow{Field::rsrp0, 16, 10, 12, kRsrp}, FieldRow{Field::rsrp1, 20, 12, 12, kRsrp},
    FieldRow{Field::rsrp, 28, 12, 12, kRsrp},  FieldRow{Field::rsrq0, 32, 12, 10, kRsrq},
    FieldRow{Field::rsrq1, 36, 0, 10, kRsrq},  FieldRow{Field::rsrq, 40, 10, 10, kRsrq},
    FieldRow{Field::rssi0, 44, 10, 11, kRssi}, FieldRow{Field::rssi1, 44, 21, 11, kRssi},
    FieldRow{Field::rssi, 52, 0, 11, kRssi},   FieldRow{Field::snr0, 76, 0, 9, kSnr},
    FieldRow{Field::snr1, 76, 9, 9, kSnr},
};

// Four antennas.
inline constexpr std::array kLevelsC = {
    FieldRow{Field::rsrp0, 16, 10, 12, kRsrp},      FieldRow{Field::rsrp1, 20, 12, 12, kRsrp},
    FieldRow{Field::rsrp2, 24, 12, 12, kRsrp},      FieldRow{Field::rsrp3, 28, 0, 12, kRsrp},
    FieldRow{Field::rsrp, 28, 12, 12, kRsrpLess40}, FieldRow{Field::rsrq0, 36, 0, 10, kRsrq},
    FieldRow{Field::rsrq1, 36, 20, 10, kRsrq},      FieldRow{Field::rsrq2, 40, 10, 10, kRsrq},
    FieldRow{Field::rsrq3, 40, 20, 10, kRsrq},      FieldRow{Field::rsrq, 44, 0, 10, kRsrq},
    FieldRow{Field::rssi0, 48, 0, 11, kRssi},       FieldRow{Field::rssi1, 48, 11, 11, kRssi},
    FieldRow{Field::rssi2, 52, 0, 11, kRssi},       FieldRow{Field::rssi3, 52, 11, 11, kRssi},
    FieldRow{Field::rssi, 56, 0, 11, kRssi},
};

// As C, but with a word more between the third and the fourth antenna.
inline constexpr std::array kLevelsD = {
    FieldRow{Field::rsrp0, 16, 10, 12, kRsrp},      FieldRow{Field::rsrp1, 20, 12, 12, kRsrp},
    FieldRow{Field::rsrp2, 24, 12, 12, kRsrp},      FieldRow{Field::rsrp3, 32, 0, 12, kRsrp},
    FieldRow{Field::rsrp, 32, 12, 12, kRsrpLess40}, FieldRow{Field::rsrq0, 40, 0, 10, kRsrq},
    FieldRow{Field::rsrq1, 40, 20, 10, kRsrq},      FieldRow{Field::rsrq2, 44, 10, 10, kRsrq},
    FieldRow{Field::rsrq3, 44, 20, 10, kRsrq},      FieldRow{Field::rsrq, 48, 0, 10, kRsrq},
    FieldRow{Field::rssi0, 52, 0, 11, kRssi},       FieldRow{Field::rssi1, 52, 11, 11, kRssi},
    FieldRow{Field::rssi2, 56, 0, 11, kRssi},       FieldRow{Field::rssi3, 56, 11, 11, kRssi},
    FieldRow{Field::rssi, 60, 0, 11, kRssi},
};

// Signal to noise of four antennas; it begins at another place in each version.
inline constexpr std::array kSnrOfFour = {
    FieldRow{Field::snr0, 0, 0, 9, kSnr},
    FieldRow{Field::snr1, 0, 9, 9, kSnr},
    FieldRow{Field::snr2, 4, 0, 9, kSnr},
    FieldRow{Field::snr3, 4, 9, 9, kSnr},
};

// A neighbour's, in the logs that list them.
inline constexpr std::array kListedNeighbour = {
    FieldRow{Field::pci, 0, 0, 10},           FieldRow{Field::rsrp0, 4, 0, 12, kRsrp},
    FieldRow{Field::rsrp1, 8, 0, 12, kRsrp},  FieldRow{Field::rsrp, 12, 0, 12, kRsrp},
    FieldRow{Field::rsrq0, 16, 0, 10, kRsrq}, FieldRow{Field::rsrq1, 16, 20, 10, kRsrq},
    FieldRow{Field::rsrq, 20, 10, 10, kRsrq}, FieldRow{Field::rssi0, 24, 0, 11, kRssi},
    FieldRow{Field::rssi1, 28, 0, 11, kRssi}, FieldRow{Field::rssi, 28, 11, 11, kRssi},
};

}  // namespace qel::diagnostics
