#include "tools/LiveConnection.h"

#include <sysexits.h>

#include <cstdlib>

#include "base/TerminalText.h"
#include "feed/FeedBook.h"
#include "metrics/MetricValidator.h"
#include "tools/Service.h"
#include "ui/screens/RootNavigationController.h"

namespace qel::tools {

void startAsTheViewerDoes() { std::make_shared<RootNavigationController>()->loadViewIfNeeded(); }

void connectToService(const LiveOptions& options, MainLoop& loop) {
  requireService(options.bus);
  connectWithoutWaiting(options, loop);
}

std::shared_ptr<tesk::Connector> connectWithoutWaiting(const LiveOptions& options, MainLoop& loop) {
  const auto told = [own = serviceObserver(options.say, startAsTheViewerDoes),
                     also = options.reachability](bool isReachable, const std::string& why) {
    own(isReachable, why);
    if (also) also(isReachable, why);
  };
  std::shared_ptr<tesk::Connector> connector =
      tesk::bus::makeBusConnector({options.bus}, told, loop.answerWaits(), options.condition);
  tesk::setConnector(connector);
  startAsTheViewerDoes();
  return connector;
}

void followService(const std::string& bus, const History::Limits& limits, Output& output,
                   const LiveTurn& turn) {
  MainLoop loop;
  loop.watchStandardOutput();
  findResources();
  configurationFile();
  output.goOnWithoutReader();
  static auto& history = *new History(limits);  // the connection outlives this function
  const auto book = std::make_shared<FeedBook>("", bus);
  book->setHistory(&history);
  connectToService({.bus = bus,
                    .say = [](const std::string& text) { complain("qelctl", text); },
                    .reachability = book->reachability(),
                    .condition = book->condition()},
                   loop);
  MetricValidator::shared()->setObserver(&history);  // no event has been taken yet
  while (loop.runOnce(turn(history, book->feed()))) {
  }
  output.flush();
  // The viewer's connection is never released; its threads must not see the process taken apart.
  std::_Exit(EX_OK);
}

}  // namespace qel::tools
