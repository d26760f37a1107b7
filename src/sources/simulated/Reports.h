// The payloads of the metrics, from the state of the simulated phone.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "base/SmallBlocks.h"
#include "radio/Levels.h"
#include "sources/simulated/Phone.h"
#include "sources/simulated/RadioScene.h"

namespace qel::sources {

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

inline constexpr double kMostPowerDbm = 23;
inline constexpr double kLeastPowerDbm = -40;

// The detected cells of the technology but the serving one, the strongest first, at most so many.
using CellList = std::vector<std::size_t, SmallBlockAllocator<std::size_t>>;
CellList neighbours(const PhoneView& view, Technology technology, std::size_t most);

}  // namespace qel::sources
