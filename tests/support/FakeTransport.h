// A service that keeps what it is asked, answers as told, and sends events when a test says so.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "base/Value.h"
#include "tesk/Transport.h"

namespace qel::testing {

struct FakeService {
  struct Command {
    std::string name;
    Dictionary request;
  };

  std::vector<std::string> clients;  // every connection's client name
  std::vector<std::string> calls;    // "on", "off" and command names, in order
  std::vector<Command> commands;
  std::function<tesk::CommandResult(std::string_view command)> answer = [](std::string_view) {
    return tesk::CommandResult{0, "done"};
  };
  tesk::EventSink sink;

  void send(std::string_view eventName, Dictionary event) {
    sink(eventName, tesk::Message(std::move(event)));
  }
};

class FakeTransport final : public tesk::Transport {
 public:
  explicit FakeTransport(std::shared_ptr<FakeService> service) : _service(std::move(service)) {}

  tesk::CommandResult performCommand(std::string_view command, const tesk::Message& request,
                                     tesk::Message&) override {
    _service->calls.emplace_back(command);
    _service->commands.push_back({std::string(command), request.entries()});
    return _service->answer(command);
  }
  void eventsOn() override { _service->calls.emplace_back("on"); }
  void eventsOff() override { _service->calls.emplace_back("off"); }

 private:
  std::shared_ptr<FakeService> _service;
};

class FakeConnector final : public tesk::Connector {
 public:
  explicit FakeConnector(std::shared_ptr<FakeService> service) : _service(std::move(service)) {}

  std::unique_ptr<tesk::Transport> connect(std::string_view clientName,
                                           tesk::EventSink sink) override {
    _service->clients.emplace_back(clientName);
    _service->sink = std::move(sink);
    return std::make_unique<FakeTransport>(_service);
  }

 private:
  std::shared_ptr<FakeService> _service;
};

// Installs a fake service as the way to the baseband manager.
inline std::shared_ptr<FakeService> installFakeService() {
  auto service = std::make_shared<FakeService>();
  tesk::setConnector(std::make_shared<FakeConnector>(service));
  return service;
}

}  // namespace qel::testing
