#include "peers/StockMessages.h"

#include <google/protobuf/message.h>

#include <cstdlib>
#include <string>

#include "bands.pb.h"
#include "gsm.pb.h"
#include "lte_neighbours.pb.h"
#include "lte_serving.pb.h"
#include "messages/catalogue/MetricMessages.h"
#include "nas.pb.h"
#include "sim.pb.h"
#include "wcdma.pb.h"

namespace qel::bench {

const google::protobuf::Message* stockPrototype(std::uint32_t metric) {
  // Naming one message of each file keeps the linker from dropping its descriptors.
  static const google::protobuf::Message* const linked[] = {
      &qelwatch::schema::KCellularLteRrcState::default_instance(),
      &qelwatch::schema::KCellularLteNbrEutraCellMeas::default_instance(),
      &qelwatch::schema::KCellularWcdmaTxPower::default_instance(),
      &qelwatch::schema::KCellularGsmGprsConfig::default_instance(),
      &qelwatch::schema::KCellularMmContext::default_instance(),
      &qelwatch::schema::KCellularSimCardFiles::default_instance(),
  };
  const std::string name = "qelwatch.schema." + std::string(findMetricMessage(metric)->className);
  const auto* descriptor = linked[0]->GetDescriptor()->file()->pool()->FindMessageTypeByName(name);
  if (!descriptor) std::abort();
  return google::protobuf::MessageFactory::generated_factory()->GetPrototype(descriptor);
}

}  // namespace qel::bench
