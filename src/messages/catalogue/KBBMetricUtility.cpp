#include "messages/catalogue/KBBMetricUtility.h"

#include <algorithm>
#include <array>

#include "messages/catalogue/TagLog.h"

namespace qel {
namespace {

constexpr std::array<MetricName, 31> kCatalogue = {{
    {19972, "KCellularLteRrcState"},
    {19992, "KCellularLteCdrxConfig"},
    {20005, "KCellularLteRadioLinkFailure"},
    {16578, "KCellularLteScellInfo"},
    {54030, "KCellularLteSelReselCellInfo"},
    {54017, "KCellularLteServingCellMeasurement"},
    {54018, "KCellularLteTxPower"},
    {20330, "KCellularRsrpRsrqSinr"},
    {54540, "KCellularEmmContext"},
    {54027, "KCellularLteComponentCarrierInfo"},
    {54035, "KCellularLteCarrierAggregationStatus"},
    {54032, "KCellularLteNbrInterRatCellMeas"},
    {54031, "KCellularLteNbrEutraCellMeas"},
    {54537, "KCellularMmCommonInfo"},
    {54541, "KCellularActivatedBearerContexts"},
    {53522, "KCellularWcdmaRrcConnectionState"},
    {12300, "KCellularWcdmaCellInfo"},
    {53506, "KCellularWcdmaScellMeasurement"},
    {53507, "KCellularWcdmaTxPower"},
    {53509, "KCellularWcdmaNbrCellMeas"},
    {53508, "KCellularWcdmaSelReselCellInfo"},
    {53523, "KCellularWcdmaRrcConfiguration"},
    {54538, "KCellularMmContext"},
    {54539, "KCellularGmmContext"},
    {11788, "kCellularGsmScellInfo"},
    {53249, "kCellularGsmIdleConfig"},
    {53250, "kCellularGsmIdleScellMeasurement"},
    {53251, "kCellularGsmCsRfMeasurement"},
    {53257, "kCellularGsmGrrEventMeasCr"},
    {53260, "kCellularGsmGprsConfig"},
    {19, "kCellularSimCardFiles"},
}};

constexpr auto sortedIdentifiers() {
  std::array<std::uint32_t, kCatalogue.size()> identifiers{};
  std::ranges::transform(kCatalogue, identifiers.begin(), &MetricName::identifier);
  std::ranges::sort(identifiers);
  return identifiers;
}

constexpr auto kSortedIdentifiers = sortedIdentifiers();
static_assert(kSortedIdentifiers[0] == kSmallestMetric);
static_assert(kSortedIdentifiers[1] == kSecondSmallestMetric);

}  // namespace

std::span<const MetricName> KBBMetricUtility::catalogue() { return kCatalogue; }

bool KBBMetricUtility::look(std::uint32_t tag, std::string_view /*messageClass*/) {
  if (!std::ranges::binary_search(kSortedIdentifiers, tag)) return false;
  writeTagLine("valid metricId tag");
  return true;
}

}  // namespace qel
