#include "history/ServingValues.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <span>

#include "history/PassedMetrics.h"
#include "messages/lte_serving.h"
#include "messages/runtime/ListReader.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

struct KeyedValue {
  Name one;
  Name other;
  Quantity quantity;
  float factor = 1;
  float offset = 0;
};

// Where in a record they stand: under a key (a dictionary, or a list of them), or at its top.
struct MetricPlace {
  std::int64_t metric;
  Name key;
  std::span<const KeyedValue> fields;
};

// Indexes: 36.133, 9.1.4 and 9.1.7; 25.133, 9.1.1.3 and 9.1.2.3; 45.008, 8.1.4.
constexpr std::array kSamples = {
    KeyedValue{"rsrp0", "rsrp1", Quantity::lteRsrp},
    KeyedValue{"rsrq0", "rsrq1", Quantity::lteRsrq},
    KeyedValue{"sinr0", "sinr1", Quantity::lteSinr, 0.5F},
};
constexpr std::array kLteReceiver = {
    KeyedValue{"rsrp_range", "", Quantity::lteRsrp, 1, -140},
    KeyedValue{"rsrq_range", "", Quantity::lteRsrq, 0.5F, -19.5F},
    KeyedValue{"snr", "", Quantity::lteSinr},
};
constexpr std::array kUmtsReceiver = {
    KeyedValue{"rsrp_range", "", Quantity::umtsRscp, 1, -116},
    KeyedValue{"rsrq_range", "", Quantity::umtsEcno, 0.5F, -24.5F},
};
constexpr std::array kGsmIdle = {KeyedValue{"idle_rxlev_dBm", "", Quantity::gsmRxlev}};
constexpr std::array kGsmCall = {KeyedValue{"cs_rxlev_sub", "", Quantity::gsmRxlev, 1, -110}};

constexpr std::array kPlaces = {
    MetricPlace{MetricValidator::K_LTE_RSRP_RSRQ_SINR, "avg_values", kSamples},
    MetricPlace{kLteServingMeasurement, "rx_info", kLteReceiver},
    MetricPlace{MetricValidator::K_UMTS_SCELL_MEAS, "rx_info", kUmtsReceiver},
    MetricPlace{MetricValidator::K_GSM_IDLE_SCELL_MEAS, "", kGsmIdle},
    MetricPlace{MetricValidator::K_GSM_CS_RF_MEAS, "", kGsmCall},
};

// Beyond what any phone may report (36.133, 9.1.4, 9.1.7 and 9.1.17; 25.133, 9.1; 45.008, 8.1.4).
struct Ends {
  float lowest;
  float highest;
};
constexpr std::array<Ends, kQuantities.size()> kPossible = {
    Ends{-157, -30}, Ends{-44, 3}, Ends{-30, 50}, Ends{-122, -24}, Ends{-25, 1}, Ends{-121, -20}};

}  // namespace

bool isPossible(Quantity quantity, float value) {
  const Ends& ends = kPossible[static_cast<std::size_t>(quantity)];
  return value >= ends.lowest && value <= ends.highest;
}

std::optional<std::size_t> ServingReader::placeOf(std::int64_t metric) {
  const auto found = std::ranges::find(kPlaces, metric, &MetricPlace::metric);
  if (found == kPlaces.end()) return std::nullopt;
  return static_cast<std::size_t>(found - kPlaces.begin());
}

ServingReader::ServingReader() {
  for (const MetricPlace& row : kPlaces) {
    Place& place = _places.emplace_back(Place{KnownPlace(row.key), row.key.empty(), {}});
    for (const KeyedValue& value : row.fields) {
      const Ends& ends = kPossible[static_cast<std::size_t>(value.quantity)];
      Scale& scale = place.fields.emplace_back(value.one, value.other).scale;
      scale.quantity = value.quantity;
      scale.factor = value.factor;
      scale.offset = value.offset;
      scale.lowest = std::llround(std::ceil((ends.lowest - value.offset) / value.factor));
      const auto highest = std::llround(std::floor((ends.highest - value.offset) / value.factor));
      scale.span = static_cast<std::uint64_t>(highest - scale.lowest);
    }
  }
  std::ranges::transform(_places[*placeOf(kLteServingMeasurement)].fields, _measured.begin(),
                         &Field::scale);
}

std::optional<ServingReader::Measurement> ServingReader::readMeasurement(ByteView payload) const {
  Measurement best = {kNone, kNone, kNone};
  const auto note = [&](std::size_t place, std::int64_t number) {
    best.data()[place] = std::max(best.data()[place], within(_measured.data()[place], number));
  };
  // In the order of kLteReceiver.
  const auto take = [&](const RxInfo& receiver) {
    if (receiver.hasRsrpRange()) note(0, receiver.rsrpRange());
    if (receiver.hasRsrqRange()) note(1, receiver.rsrqRange());
    if (receiver.hasSnr()) note(2, receiver.snr());
  };
  if (!readList<KCellularLteServingCellMeasurement, RxInfo>(payload, take)) return std::nullopt;
  return best;
}

std::int64_t ServingReader::otherIn(const Field& field, const Value& value) {
  const auto number = value.asInt64();
  return number ? within(field.scale, *number) : kNone;
}

std::int64_t ServingReader::bestIn(Field& field, const List& receivers) {
  std::int64_t best = kNone;
  for (const Value& receiver : receivers) {
    if (const Dictionary* sample = receiver.asDictionary()) {
      best = std::max(best, bestIn(field, Sample(*sample)));
    }
  }
  return best;
}

}  // namespace qel
