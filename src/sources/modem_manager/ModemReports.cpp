#include "sources/modem_manager/ModemReports.h"

#include <algorithm>
#include <array>

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

constexpr std::array kReports = {
    ModemReportRow{metric::kLteScellInfo, modemLteCell},
    ModemReportRow{metric::kLteServingMeasurement, modemLteMeasurement},
    ModemReportRow{metric::kLteRsrpRsrqSinr, modemLteQuality},
    ModemReportRow{metric::kLteCarrierAggregation, modemLteCarriers},
    ModemReportRow{metric::kLteNeighbours, modemLteNeighbours},
    ModemReportRow{metric::kLteInterRat, modemLteOthers},
    ModemReportRow{metric::kUmtsCellInfo, modemUmtsCell},
    ModemReportRow{metric::kUmtsServingMeasurement, modemUmtsMeasurement},
    ModemReportRow{metric::kUmtsNeighbours, modemUmtsNeighbours},
    ModemReportRow{metric::kGsmScellInfo, modemGsmCell},
    ModemReportRow{metric::kGsmIdleMeasurement, modemGsmMeasurement},
    ModemReportRow{metric::kGsmNeighbours, modemGsmNeighbours},
    ModemReportRow{metric::kEmmContext, modemEmmContext},
    ModemReportRow{metric::kMmContext, modemMmContext},
    ModemReportRow{metric::kGmmContext, modemGmmContext},
    ModemReportRow{metric::kMmCommonInfo, modemMmCommonInfo},
    ModemReportRow{metric::kBearers, modemBearers},
    ModemReportRow{metric::kSimFiles, modemSimFiles},
};

}  // namespace

std::span<const ModemReportRow> modemReports() { return kReports; }

std::vector<MetricKeeper::Row> keptModemReports() {
  std::vector<MetricKeeper::Row> rows;
  for (const ModemReportRow& row : kReports) rows.push_back({row.metric});
  return rows;
}

MetricKeeper::Build modemReportBuilder(const ModemPicture& modem) {
  return [&modem](std::uint32_t metric, std::uint64_t timeMs) {
    const auto row = std::ranges::find(kReports, metric, &ModemReportRow::metric);
    return row == kReports.end() ? std::nullopt : row->build(modem, timeMs);
  };
}

}  // namespace qel::sources
