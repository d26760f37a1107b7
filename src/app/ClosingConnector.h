// A connector whose connections can be ended from outside.
#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "tesk/Transport.h"

namespace qel {

// The client library keeps its connection for the life of the process. Closing ends the service
// behind it and its threads in order, before the process takes itself apart. Main thread only.
class ClosingConnector final : public tesk::Connector {
 public:
  explicit ClosingConnector(std::shared_ptr<tesk::Connector> connector);

  std::unique_ptr<tesk::Transport> connect(std::string_view clientName,
                                           tesk::EventSink sink) override;
  // Afterwards no event comes and every command finds the service out of reach.
  void close();

 private:
  class Link;

  std::shared_ptr<tesk::Connector> _connector;
  std::vector<std::weak_ptr<std::unique_ptr<tesk::Transport>>> _transports;
};

}  // namespace qel
