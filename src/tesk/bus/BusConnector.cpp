#include "tesk/bus/BusConnector.h"

#include "tesk/bus/BusTransport.h"

namespace tesk::bus {
namespace {

class BusConnector final : public Connector {
 public:
  BusConnector(BusAddress address, ReachabilityObserver observer, AnswerWaitMaker makeWait,
               ConditionObserver conditionObserver, std::chrono::milliseconds rest)
      : _address(std::move(address)),
        _observer(std::move(observer)),
        _makeWait(std::move(makeWait)),
        _conditionObserver(std::move(conditionObserver)),
        _rest(rest) {}

  std::unique_ptr<Transport> connect(std::string_view clientName, EventSink sink) override {
    return std::make_unique<BusTransport>(_address, std::string(clientName), std::move(sink),
                                          _observer, _makeWait, _conditionObserver, _rest);
  }

 private:
  const BusAddress _address;
  const ReachabilityObserver _observer;
  const AnswerWaitMaker _makeWait;
  const ConditionObserver _conditionObserver;
  const std::chrono::milliseconds _rest;
};

}  // namespace

std::shared_ptr<Connector> makeBusConnector(BusAddress address, ReachabilityObserver observer,
                                            AnswerWaitMaker makeWait,
                                            ConditionObserver conditionObserver,
                                            std::chrono::milliseconds rest) {
  return std::make_shared<BusConnector>(std::move(address), std::move(observer),
                                        std::move(makeWait), std::move(conditionObserver), rest);
}

}  // namespace tesk::bus
