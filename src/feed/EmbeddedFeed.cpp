#include "feed/EmbeddedFeed.h"

#include <utility>

#include "service/InProcessConnector.h"

namespace qel {

std::shared_ptr<tesk::Connector> connectWithin(const std::string& source, FeedBook& book,
                                               sources::SourceError& error) {
  return connectWithin(source, book.condition(), error);
}

std::shared_ptr<tesk::Connector> connectWithin(const std::string& source,
                                               tesk::bus::ConditionObserver tell,
                                               sources::SourceError& error) {
  auto core = service::makeServiceCore(source, error);
  if (!core) return nullptr;
  service::ConditionBook& condition = core->condition();
  condition.observe([&condition, tell = std::move(tell)] {
    const sources::SourceCondition current = condition.current();
    tell({inWords(current), std::string(current.state), current.model, current.reason});
  });
  return service::makeInProcessConnector(std::move(core));
}

}  // namespace qel
