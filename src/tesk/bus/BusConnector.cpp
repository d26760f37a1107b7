#include "tesk/bus/BusConnector.h"

#include "tesk/bus/BusTransport.h"

namespace tesk::bus {
namespace {

class BusConnector final : public Connector {
 public:
  BusConnector(BusAddress address, ReachabilityObserver observer, AnswerWaitMaker makeWait)
      : _address(std::move(address)),
        _observer(std::move(observer)),
        _makeWait(std::move(makeWait)) {}

  std::unique_ptr<Transport> connect(std::string_view clientName, EventSink sink) override {
    return std::make_unique<BusTransport>(_address, std::string(clientName), std::move(sink),
                                          _observer, _makeWait);
  }

 private:
  const BusAddress _address;
  const ReachabilityObserver _observer;
  const AnswerWaitMaker _makeWait;
};

}  // namespace

std::shared_ptr<Connector> makeBusConnector(BusAddress address, ReachabilityObserver observer,
                                            AnswerWaitMaker makeWait) {
  return std::make_shared<BusConnector>(std::move(address), std::move(observer),
                                        std::move(makeWait));
}

}  // namespace tesk::bus
