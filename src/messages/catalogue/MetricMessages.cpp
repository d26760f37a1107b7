#include "messages/catalogue/MetricMessages.h"

#include <algorithm>
#include <array>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"

namespace qel {
namespace {

template <class Message>
constexpr MetricMessage row(std::uint32_t identifier) {
  return {identifier,
          Message::kClassName,
          decodeMessage<Message>,
          Message::dictionaryWithData,
          Message::isReadable,
          &ShapeOf<Message>::kShape};
}

constexpr std::array<MetricMessage, 30> kMetricMessages = {
    row<KCellularLteRrcState>(19972),
    row<KCellularLteCdrxConfig>(19992),
    row<KCellularLteScellInfo>(16578),
    row<KCellularLteSelReselCellInfo>(54030),
    row<KCellularLteServingCellMeasurement>(54017),
    row<KCellularLteTxPower>(54018),
    row<KCellularLteRsrpRsrqSinr>(20330),
    row<KCellularEmmContext>(54540),
    row<KCellularLteComponentCarrierInfo>(54027),
    row<KCellularLteCarrierAggregationStatus>(54035),
    row<KCellularLteNbrInterRatCellMeas>(54032),
    row<KCellularLteNbrEutraCellMeas>(54031),
    row<KCellularMmCommonInfo>(54537),
    row<KCellularActivatedBearerContexts>(54541),
    row<KCellularWcdmaRrcConnectionState>(53522),
    row<KCellularWcdmaCellInfo>(12300),
    row<KCellularWcdmaScellMeasurement>(53506),
    row<KCellularWcdmaTxPower>(53507),
    row<KCellularWcdmaNbrCellMeas>(53509),
    row<KCellularWcdmaSelReselCellInfo>(53508),
    row<KCellularWcdmaRrcConfiguration>(53523),
    row<KCellularMmContext>(54538),
    row<KCellularGmmContext>(54539),
    row<KCellularGsmScellInfo>(11788),
    row<KCellularGsmIdleConfig>(53249),
    row<KCellularGsmIdleScellMeasurement>(53250),
    row<KCellularGsmCsRfMeasurement>(53251),
    row<KCellularGsmGrrEventMeasCr>(53257),
    row<KCellularGsmGprsConfig>(53260),
    row<KCellularSimCardFiles>(19),
};

}  // namespace

std::span<const MetricMessage> metricMessages() { return kMetricMessages; }

const MetricMessage* findMetricMessage(std::uint32_t identifier) {
  const auto found = std::ranges::find(kMetricMessages, identifier, &MetricMessage::identifier);
  return found == kMetricMessages.end() ? nullptr : &*found;
}

}  // namespace qel
