// All message classes, at compile time and by name.
#pragma once

#include <memory>
#include <span>
#include <string_view>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"

namespace qel::testing {

template <class... Messages>
struct MessageList {
  static constexpr std::size_t kCount = sizeof...(Messages);

  // Calls visit.operator()<Message>() for every class.
  template <class Visit>
  static void forEach(Visit&& visit) {
    (visit.template operator()<Messages>(), ...);
  }
};

// A test compares this list with the schemas.
using AllMessages = MessageList<
    BearerContext, EgwErrcNbrEutraMeas, EgwErrcNbrGeranMeas, EgwErrcNbrUtraMeas, ElementaryFile,
    EutraFreqInfo, GsmCellMeasResult, GsmFreqInfo, GsmNcellMeas, Guti,
    KCellularActivatedBearerContexts, KCellularEmmContext, KCellularGmmContext,
    KCellularGsmCsRfMeasurement, KCellularGsmGprsConfig, KCellularGsmGrrEventMeasCr,
    KCellularGsmIdleConfig, KCellularGsmIdleScellMeasurement, KCellularGsmScellInfo,
    KCellularLocationAreaId, KCellularLteCarrierAggregationStatus, KCellularLteCdrxConfig,
    KCellularLteComponentCarrierInfo, KCellularLteNbrEutraCellMeas, KCellularLteNbrInterRatCellMeas,
    KCellularLteRrcState, KCellularLteRsrpRsrqSinr, KCellularLteScellInfo,
    KCellularLteSelReselCellInfo, KCellularLteServingCellMeasurement, KCellularLteTxPower,
    KCellularMmCommonInfo, KCellularMmContext, KCellularSimCardFiles, KCellularTrackingAreaId,
    KCellularWcdmaCellInfo, KCellularWcdmaNbrCellMeas, KCellularWcdmaRrcConfiguration,
    KCellularWcdmaRrcConnectionState, KCellularWcdmaScellMeasurement,
    KCellularWcdmaSelReselCellInfo, KCellularWcdmaTxPower, LteCellMeasResult, LteNcellMeas,
    NbrEutra, Plmn, RoutingAreaId, RsrpRsrqSinr, RxInfo, SecondaryComponentCarrier, TxPowerInfo,
    UmtsNcellMeas, UtraCellMeasResult, UtraFreqInfo>;

struct MessageClass {
  std::string_view name;
  std::shared_ptr<PBCodable> (*make)();
  std::shared_ptr<PBCodable> (*decode)(ByteView bytes);
};

std::span<const MessageClass> messageClasses();

}  // namespace qel::testing
