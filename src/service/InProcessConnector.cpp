#include "service/InProcessConnector.h"

#include <utility>

#include "sources/SourceChoice.h"

namespace qel::service {
namespace {

class InProcessTransport final : public tesk::Transport {
 public:
  InProcessTransport(std::shared_ptr<ServiceCore> core, std::string_view clientName,
                     tesk::EventSink sink)
      : _core(std::move(core)), _session(_core->open(clientName, std::move(sink))) {}
  ~InProcessTransport() override { _core->close(_session); }

  tesk::CommandResult performCommand(std::string_view command, const tesk::Message& request,
                                     tesk::Message& /*reply*/) override {
    return _core->performCommand(*_session, command, request);
  }
  void eventsOn() override { _core->eventsOn(*_session); }
  void eventsOff() override { _core->eventsOff(*_session); }

 private:
  const std::shared_ptr<ServiceCore> _core;
  const std::shared_ptr<Session> _session;
};

class InProcessConnector final : public tesk::Connector {
 public:
  explicit InProcessConnector(std::shared_ptr<ServiceCore> core) : _core(std::move(core)) {}

  std::unique_ptr<tesk::Transport> connect(std::string_view clientName,
                                           tesk::EventSink sink) override {
    return std::make_unique<InProcessTransport>(_core, clientName, std::move(sink));
  }

 private:
  const std::shared_ptr<ServiceCore> _core;
};

}  // namespace

std::shared_ptr<ServiceCore> makeServiceCore(const std::string& sourceText,
                                             sources::SourceError& error,
                                             std::unique_ptr<StateKeeper> keeper) {
  const auto choice = sources::parseSourceChoice(sourceText, error);
  if (!choice) return nullptr;
  auto source = sources::makeSource(*choice, error);
  if (!source) return nullptr;
  return ServiceCore::create(std::move(source), systemClock(), std::move(keeper));
}

std::shared_ptr<tesk::Connector> makeInProcessConnector(std::shared_ptr<ServiceCore> core) {
  return std::make_shared<InProcessConnector>(std::move(core));
}

std::shared_ptr<tesk::Connector> makeInProcessConnector(const std::string& sourceText,
                                                        sources::SourceError& error) {
  auto core = makeServiceCore(sourceText, error);
  return core ? makeInProcessConnector(std::move(core)) : nullptr;
}

}  // namespace qel::service
