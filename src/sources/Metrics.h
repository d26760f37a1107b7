// The identifiers of the metrics that sources report (16 bits, as in the catalogue).
#pragma once

#include <cstdint>

namespace qel::metric {

inline constexpr std::uint32_t kLteRrcState = 19972;
inline constexpr std::uint32_t kLteCdrxConfig = 19992;
inline constexpr std::uint32_t kLteRadioLinkFailure = 20005;
inline constexpr std::uint32_t kLteScellInfo = 16578;
inline constexpr std::uint32_t kLteSelRes = 54030;
inline constexpr std::uint32_t kLteServingMeasurement = 54017;
inline constexpr std::uint32_t kLteTxPower = 54018;
inline constexpr std::uint32_t kLteRsrpRsrqSinr = 20330;
inline constexpr std::uint32_t kEmmContext = 54540;
inline constexpr std::uint32_t kLteComponentCarriers = 54027;
inline constexpr std::uint32_t kLteCarrierAggregation = 54035;
inline constexpr std::uint32_t kLteInterRat = 54032;
inline constexpr std::uint32_t kLteNeighbours = 54031;
inline constexpr std::uint32_t kMmCommonInfo = 54537;
inline constexpr std::uint32_t kBearers = 54541;
inline constexpr std::uint32_t kUmtsRrcState = 53522;
inline constexpr std::uint32_t kUmtsCellInfo = 12300;
inline constexpr std::uint32_t kUmtsServingMeasurement = 53506;
inline constexpr std::uint32_t kUmtsTxPower = 53507;
inline constexpr std::uint32_t kUmtsNeighbours = 53509;
inline constexpr std::uint32_t kUmtsSelRes = 53508;
inline constexpr std::uint32_t kUmtsRrcConfig = 53523;
inline constexpr std::uint32_t kMmContext = 54538;
inline constexpr std::uint32_t kGmmContext = 54539;
inline constexpr std::uint32_t kGsmScellInfo = 11788;
inline constexpr std::uint32_t kGsmIdleConfig = 53249;
inline constexpr std::uint32_t kGsmIdleMeasurement = 53250;
inline constexpr std::uint32_t kGsmCallMeasurement = 53251;
inline constexpr std::uint32_t kGsmNeighbours = 53257;
inline constexpr std::uint32_t kGsmGprsConfig = 53260;
inline constexpr std::uint32_t kSimFiles = 19;

}  // namespace qel::metric
