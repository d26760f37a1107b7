#include "tools/LiveConnection.h"

#include <memory>

#include "tools/Service.h"
#include "ui/screens/RootNavigationController.h"

namespace qel::tools {

void startAsTheViewerDoes() { std::make_shared<RootNavigationController>()->loadViewIfNeeded(); }

void connectToService(const LiveOptions& options, MainLoop& loop) {
  requireService(options.bus);
  connectWithoutWaiting(options, loop);
}

void connectWithoutWaiting(const LiveOptions& options, MainLoop& loop) {
  const auto told = [own = serviceObserver(options.say, startAsTheViewerDoes),
                     also = options.reachability](bool isReachable, const std::string& why) {
    own(isReachable, why);
    if (also) also(isReachable, why);
  };
  tesk::setConnector(
      tesk::bus::makeBusConnector({options.bus}, told, loop.answerWaits(), options.condition));
  startAsTheViewerDoes();
}

}  // namespace qel::tools
