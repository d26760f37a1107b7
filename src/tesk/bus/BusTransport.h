// A client's connection over the bus that mends itself.
#pragma once

#include <memory>
#include <thread>

#include "tesk/Transport.h"
#include "tesk/bus/BusConnector.h"

namespace tesk::bus {

// A thread of its own does all that touches the bus; calls hand it work, and only a command waits
// for what came of it. The end waits for nobody but a sink that is at work.
class BusTransport final : public Transport {
 public:
  BusTransport(BusAddress address, std::string clientName, EventSink sink,
               ReachabilityObserver observer, AnswerWaitMaker makeWait,
               ConditionObserver conditionObserver, std::chrono::milliseconds rest);
  ~BusTransport() override;

  CommandResult performCommand(std::string_view command, const Message& request,
                               Message& reply) override;
  void eventsOn() override;
  void eventsOff() override;

 private:
  class Worker;

  const AnswerWaitMaker _makeWait;
  const std::shared_ptr<Worker> _worker;  // the thread's too
  std::thread _thread;
};

}  // namespace tesk::bus
