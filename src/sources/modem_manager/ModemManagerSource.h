// The metrics of a real modem, as far as ModemManager knows them.
#pragma once

#include <memory>
#include <mutex>
#include <string>

#include "sources/EventSource.h"
#include "sources/RunThreads.h"
#include "sources/modem_manager/ModemLink.h"

namespace qel::sources {

// While it runs it has one thread with a bus connection of its own, which comes back by itself
// after the loss of the bus, of ModemManager or of the modem; meanwhile no metric has a value.
// Events that nobody takes are dropped; whoever listens next gets all that is known.
//
// A run's thread owns what it works with, so that the source may be stopped and even destroyed from
// within an event of its own; from any other thread the destructor waits for the run to end.
class ModemManagerSource final : public EventSource {
 public:
  ModemManagerSource(ModemWish wish, bus::BusAddress address, ModemTiming timing = {});
  ~ModemManagerSource() override;

  void start(std::weak_ptr<EventReceiver> receiver,
             std::shared_ptr<ListenerSignal> listeners) override;
  void stop() override;
  SourceAnswer query(std::uint32_t metric) override;
  std::string description() const override;

 private:
  struct Run;

  const ModemWish _wish;
  const bus::BusAddress _address;
  const ModemTiming _timing;

  std::mutex _mutex;  // guards the two below; no event runs under it
  std::shared_ptr<Run> _run;
  RunThreads _threads;  // last: they end first
};

}  // namespace qel::sources
