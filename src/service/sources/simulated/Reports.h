// The payloads of the metrics, from the state of the simulated phone.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "service/sources/simulated/Phone.h"
#include "service/sources/simulated/RadioScene.h"

namespace qel::service {

// One sample of the serving LTE cell, kept for the next report of a run of them.
struct QualitySample {
  std::uint32_t code = 0;
  CellSignal signal;
};

// What a report is made from.
struct PhoneView {
  const RadioScene& scene;
  const Phone& phone;
  const std::vector<QualitySample>& samples;

  const Cell& cell() const { return phone.serving(); }
  const CellSignal& signal() const { return scene.of(phone.servingIndex()); }
  bool on(Technology technology) const { return phone.technology() == technology; }
};

// A payload with that time stamp; nothing when the metric has no value now.
using BuildReport = std::optional<Bytes> (*)(const PhoneView& view, std::uint64_t timeMs);

std::optional<Bytes> lteRrcState(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteCdrxConfig(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteRadioLinkFailure(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteScellInfo(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteSelRes(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteServingMeasurement(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteTxPower(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteRsrpRsrqSinr(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteComponentCarriers(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteCarrierAggregation(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteInterRat(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> lteNeighbours(const PhoneView& view, std::uint64_t timeMs);

std::optional<Bytes> umtsRrcState(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsRrcConfig(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsCellInfo(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsServingMeasurement(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsTxPower(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsSelRes(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> umtsNeighbours(const PhoneView& view, std::uint64_t timeMs);

std::optional<Bytes> gsmScellInfo(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gsmIdleConfig(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gsmIdleMeasurement(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gsmCallMeasurement(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gsmNeighbours(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gsmGprsConfig(const PhoneView& view, std::uint64_t timeMs);

std::optional<Bytes> mmCommonInfo(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> mmContext(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> gmmContext(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> emmContext(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> bearers(const PhoneView& view, std::uint64_t timeMs);
std::optional<Bytes> simFiles(const PhoneView& view, std::uint64_t timeMs);

// Values as reports carry them.
inline std::int32_t rounded(double value) { return static_cast<std::int32_t>(std::lround(value)); }
inline std::uint32_t index(double value, int highest) {
  return static_cast<std::uint32_t>(std::clamp(rounded(value), 0, highest));
}
inline std::uint32_t rsrpIndex(double dbm) { return index(dbm + 140, 97); }       // 36.133, 9.1.4
inline std::uint32_t rsrqIndex(double db) { return index((db + 19.5) * 2, 34); }  // 36.133, 9.1.7
inline std::uint32_t rscpIndex(double dbm) { return index(dbm + 116, 91); }       // 25.133, 9.1.1.3
inline std::uint32_t ecnoIndex(double db) { return index((db + 24.5) * 2, 49); }  // 25.133, 9.1.2.3
inline std::uint32_t rxlevIndex(double dbm) { return index(dbm + 110, 63); }      // 45.008, 8.1.4

inline constexpr double kMostPowerDbm = 23;
inline constexpr double kLeastPowerDbm = -40;

// The detected cells of the technology but the serving one, the strongest first, at most so many.
std::vector<std::size_t> neighbours(const PhoneView& view, Technology technology, std::size_t most);

}  // namespace qel::service
