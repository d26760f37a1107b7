#include "history/ServingValues.h"

#include <algorithm>
#include <array>
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
  ServingScale scale;
};

// Where in a record they stand: under a key (a dictionary, or a list of them), or at its top.
struct MetricPlace {
  std::int64_t metric;
  Name key;
  std::span<const KeyedValue> fields;
};

// Indexes: 36.133, 9.1.4 and 9.1.7; 25.133, 9.1.1.3 and 9.1.2.3; 45.008, 8.1.4.
constexpr std::array kSamples = {
    KeyedValue{"rsrp0", "rsrp1", ServingScale(Quantity::lteRsrp)},
    KeyedValue{"rsrq0", "rsrq1", ServingScale(Quantity::lteRsrq)},
    KeyedValue{"sinr0", "sinr1", ServingScale(Quantity::lteSinr, 0.5F)},
};
constexpr std::array kLteReceiver = {
    KeyedValue{"rsrp_range", "", ServingReader::kRsrpIndex},
    KeyedValue{"rsrq_range", "", ServingReader::kRsrqIndex},
    KeyedValue{"snr", "", ServingReader::kSnr},
};
constexpr std::array kUmtsReceiver = {
    KeyedValue{"rsrp_range", "", ServingScale(Quantity::umtsRscp, 1, -116)},
    KeyedValue{"rsrq_range", "", ServingScale(Quantity::umtsEcno, 0.5F, -24.5F)},
};
constexpr std::array kGsmIdle = {
    KeyedValue{"idle_rxlev_dBm", "", ServingScale(Quantity::gsmRxlev)}};
constexpr std::array kGsmCall = {
    KeyedValue{"cs_rxlev_sub", "", ServingScale(Quantity::gsmRxlev, 1, -110)}};

constexpr std::array kPlaces = {
    MetricPlace{MetricValidator::K_LTE_RSRP_RSRQ_SINR, "avg_values", kSamples},
    MetricPlace{kLteServingMeasurement, "rx_info", kLteReceiver},
    MetricPlace{MetricValidator::K_UMTS_SCELL_MEAS, "rx_info", kUmtsReceiver},
    MetricPlace{MetricValidator::K_GSM_IDLE_SCELL_MEAS, "", kGsmIdle},
    MetricPlace{MetricValidator::K_GSM_CS_RF_MEAS, "", kGsmCall},
};

}  // namespace

bool isPossible(Quantity quantity, float value) {
  const PossibleValues possible = possibleValues(quantity);
  return value >= possible.lowest && value <= possible.highest;
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
      place.fields.emplace_back(value.one, value.other, value.scale);
    }
  }
}

std::optional<ServingReader::Measurement> ServingReader::readMeasurement(ByteView payload) {
  Measurement best;
  const auto take = [&best](const RxInfo& receiver) {
    if (receiver.hasRsrpRange()) {
      best.rsrp = std::max(best.rsrp, within(kRsrpIndex, receiver.rsrpRange()));
    }
    if (receiver.hasRsrqRange()) {
      best.rsrq = std::max(best.rsrq, within(kRsrqIndex, receiver.rsrqRange()));
    }
    if (receiver.hasSnr()) best.sinr = std::max(best.sinr, within(kSnr, receiver.snr()));
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
