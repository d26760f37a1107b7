#include "app/ClosingConnector.h"

#include <utility>

namespace qel {

class ClosingConnector::Link final : public tesk::Transport {
 public:
  explicit Link(std::shared_ptr<std::unique_ptr<tesk::Transport>> transport)
      : _transport(std::move(transport)) {}

  tesk::CommandResult performCommand(std::string_view command, const tesk::Message& request,
                                     tesk::Message& reply) override {
    if (!*_transport) return {tesk::kServiceUnreachable, "the connection is closed"};
    return (*_transport)->performCommand(command, request, reply);
  }
  void eventsOn() override {
    if (*_transport) (*_transport)->eventsOn();
  }
  void eventsOff() override {
    if (*_transport) (*_transport)->eventsOff();
  }

 private:
  std::shared_ptr<std::unique_ptr<tesk::Transport>> _transport;  // holds nothing once closed
};

ClosingConnector::ClosingConnector(std::shared_ptr<tesk::Connector> connector)
    : _connector(std::move(connector)) {}

std::unique_ptr<tesk::Transport> ClosingConnector::connect(std::string_view clientName,
                                                           tesk::EventSink sink) {
  if (!_connector) return nullptr;
  auto transport = _connector->connect(clientName, std::move(sink));
  if (!transport) return nullptr;
  auto held = std::make_shared<std::unique_ptr<tesk::Transport>>(std::move(transport));
  _transports.push_back(held);
  return std::make_unique<Link>(std::move(held));
}

void ClosingConnector::close() {
  for (const auto& transport : std::exchange(_transports, {})) {
    if (const auto held = transport.lock()) held->reset();
  }
  _connector.reset();
}

}  // namespace qel
