#include "history/ServingValues.h"

#include <algorithm>
#include <span>

#include "history/PassedMetrics.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

struct Field {
  Name key;
  Quantity quantity;
  float factor = 1;
  float offset = 0;
};

// Where in a record they stand: under a key (a dictionary, or a list of them), or at its top.
struct Place {
  std::int64_t metric;
  Name key;
  std::span<const Field> fields;
};

// Indexes: 36.133, 9.1.4 and 9.1.7; 25.133, 9.1.1.3 and 9.1.2.3; 45.008, 8.1.4.
constexpr std::array kSamples = {
    Field{"rsrp0", Quantity::lteRsrp},       Field{"rsrp1", Quantity::lteRsrp},
    Field{"rsrq0", Quantity::lteRsrq},       Field{"rsrq1", Quantity::lteRsrq},
    Field{"sinr0", Quantity::lteSinr, 0.5F}, Field{"sinr1", Quantity::lteSinr, 0.5F},
};
constexpr std::array kLteReceiver = {
    Field{"rsrp_range", Quantity::lteRsrp, 1, -140},
    Field{"rsrq_range", Quantity::lteRsrq, 0.5F, -19.5F},
    Field{"snr", Quantity::lteSinr},
};
constexpr std::array kUmtsReceiver = {
    Field{"rsrp_range", Quantity::umtsRscp, 1, -116},
    Field{"rsrq_range", Quantity::umtsEcno, 0.5F, -24.5F},
};
constexpr std::array kGsmIdle = {Field{"idle_rxlev_dBm", Quantity::gsmRxlev}};
constexpr std::array kGsmCall = {Field{"cs_rxlev_sub", Quantity::gsmRxlev, 1, -110}};

constexpr std::array kPlaces = {
    Place{MetricValidator::K_LTE_RSRP_RSRQ_SINR, "avg_values", kSamples},
    Place{kLteServingMeasurement, "rx_info", kLteReceiver},
    Place{MetricValidator::K_UMTS_SCELL_MEAS, "rx_info", kUmtsReceiver},
    Place{MetricValidator::K_GSM_IDLE_SCELL_MEAS, "", kGsmIdle},
    Place{MetricValidator::K_GSM_CS_RF_MEAS, "", kGsmCall},
};

// Beyond what any phone may report (36.133, 9.1.4, 9.1.7 and 9.1.17; 25.133, 9.1; 45.008, 8.1.4).
struct Ends {
  float lowest;
  float highest;
};
constexpr std::array<Ends, kQuantities.size()> kPossible = {
    Ends{-157, -30}, Ends{-44, 3}, Ends{-30, 50}, Ends{-122, -24}, Ends{-25, 1}, Ends{-121, -20}};

void collect(const Dictionary& from, std::span<const Field> fields, ServingValues& values) {
  for (const Field& field : fields) {
    const Value* value = from.find(field.key.view());
    const auto number = value ? value->asFloat() : std::nullopt;
    if (!number) continue;
    const float scaled = *number * field.factor + field.offset;
    if (!isPossible(field.quantity, scaled)) continue;
    auto& best = values[static_cast<std::size_t>(field.quantity)];
    best = best ? std::max(*best, scaled) : scaled;
  }
}

}  // namespace

bool hasServingValues(std::int64_t metric) {
  return std::ranges::find(kPlaces, metric, &Place::metric) != kPlaces.end();
}

ServingValues servingValues(std::int64_t metric, const Dictionary& record) {
  ServingValues values;
  const auto place = std::ranges::find(kPlaces, metric, &Place::metric);
  if (place == kPlaces.end()) return values;
  if (place->key.empty()) {
    collect(record, place->fields, values);
  } else if (const Value* held = record.find(place->key.view())) {
    if (const Dictionary* sample = held->asDictionary()) collect(*sample, place->fields, values);
    if (const List* list = held->asList()) {
      for (const Value& entry : *list) {
        if (const Dictionary* receiver = entry.asDictionary()) {
          collect(*receiver, place->fields, values);
        }
      }
    }
  }
  return values;
}

bool isPossible(Quantity quantity, float value) {
  const Ends& ends = kPossible[static_cast<std::size_t>(quantity)];
  return value >= ends.lowest && value <= ends.highest;
}

}  // namespace qel
