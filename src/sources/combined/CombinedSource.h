// A modem's diagnostics port and ModemManager as one source: of each metric the better one is
// heard.
#pragma once

#include <memory>
#include <mutex>
#include <string>

#include "sources/EventSource.h"

namespace qel::sources {

// Either may come and go; no metric is told by both at a time. The two tell on threads of their
// own, and one after the other is let to the receiver.
class CombinedSource final : public EventSource {
 public:
  // Whether it is worth a word that there is no port.
  enum class Port { missed, welcome };

  CombinedSource(std::shared_ptr<EventSource> port, std::shared_ptr<EventSource> manager,
                 Port wish);
  ~CombinedSource() override;

  void start(std::weak_ptr<EventReceiver> receiver,
             std::shared_ptr<ListenerSignal> listeners) override;
  void stop() override;
  SourceAnswer query(std::uint32_t metric) override;
  std::string description() const override;
  SourceFacts facts() const override;

 private:
  class Run;
  class Ear;

  const std::shared_ptr<EventSource> _port;
  const std::shared_ptr<EventSource> _manager;
  const Port _wish;

  std::mutex _mutex;  // guards those below; neither source is called under it
  std::shared_ptr<Run> _run;
  std::shared_ptr<Ear> _portEar;
  std::shared_ptr<Ear> _managerEar;
};

}  // namespace qel::sources
