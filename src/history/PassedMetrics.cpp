#include "history/PassedMetrics.h"

#include "messages/lte_serving.h"

namespace qel {

const DispatchRow& lteServingMeasurementRow() {
  static constexpr DispatchRow kRow = {kLteServingMeasurement,
                                       KCellularLteServingCellMeasurement::dictionaryWithData,
                                       nullptr,
                                       "",
                                       {}};
  return kRow;
}

}  // namespace qel
