#include "sources/simulated/ReportTable.h"

#include <algorithm>
#include <array>

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

using namespace metric;

// What changes seldom is repeated every five seconds, for clients that come later.
constexpr std::array<ReportRow, 31> kTable = {{
    {kLteRrcState, 0, 0, true, lteRrcState},
    {kLteCdrxConfig, 5000, 12, true, lteCdrxConfig},
    {kLteRadioLinkFailure, 0, 0, false, lteRadioLinkFailure},
    {kLteScellInfo, 5000, 16, true, lteScellInfo},
    {kLteSelRes, 5000, 20, true, lteSelRes},
    {kLteServingMeasurement, 400, 24, true, lteServingMeasurement},
    {kLteTxPower, 1000, 28, true, lteTxPower},
    {kLteRsrpRsrqSinr, 1000, 32, true, lteRsrpRsrqSinr},
    {kEmmContext, 5000, 40, true, emmContext},
    {kLteComponentCarriers, 5000, 44, true, lteComponentCarriers},
    {kLteCarrierAggregation, 1000, 48, true, lteCarrierAggregation},
    {kLteInterRat, 2000, 56, true, lteInterRat},
    {kLteNeighbours, 1000, 60, true, lteNeighbours},
    {kMmCommonInfo, 5000, 68, true, mmCommonInfo},
    {kBearers, 5000, 72, true, bearers},
    {kUmtsRrcState, 0, 0, false, umtsRrcState},
    {kUmtsCellInfo, 5000, 84, true, umtsCellInfo},
    {kUmtsServingMeasurement, 600, 88, true, umtsServingMeasurement},
    {kUmtsTxPower, 1000, 92, true, umtsTxPower},
    {kUmtsNeighbours, 1000, 100, true, umtsNeighbours},
    {kUmtsSelRes, 5000, 104, true, umtsSelRes},
    {kUmtsRrcConfig, 5000, 108, true, umtsRrcConfig},
    {kMmContext, 5000, 116, true, mmContext},
    {kGmmContext, 5000, 120, true, gmmContext},
    {kGsmScellInfo, 5000, 132, true, gsmScellInfo},
    {kGsmIdleConfig, 5000, 136, true, gsmIdleConfig},
    {kGsmIdleMeasurement, 1000, 140, true, gsmIdleMeasurement},
    {kGsmCallMeasurement, 400, 144, true, gsmCallMeasurement},
    {kGsmNeighbours, 2000, 152, true, gsmNeighbours},
    {kGsmGprsConfig, 5000, 156, true, gsmGprsConfig},
    {kSimFiles, 0, 0, false, simFiles},
}};

}  // namespace

std::span<const ReportRow> reportTable() { return kTable; }

const ReportRow* findReport(std::uint32_t metric) {
  const auto found = std::ranges::find(kTable, metric, &ReportRow::metric);
  return found == kTable.end() ? nullptr : &*found;
}

}  // namespace qel::sources
