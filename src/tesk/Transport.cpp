#include "tesk/Transport.h"

namespace tesk {
namespace {

std::shared_ptr<Connector>& slot() {
  static std::shared_ptr<Connector> connector;
  return connector;
}

}  // namespace

void setConnector(std::shared_ptr<Connector> connector) { slot() = std::move(connector); }
const std::shared_ptr<Connector>& connector() { return slot(); }

}  // namespace tesk
