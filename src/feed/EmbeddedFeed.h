// A source within the viewer's own process.
#pragma once

#include <memory>
#include <string>

#include "feed/FeedBook.h"
#include "sources/SourceError.h"
#include "tesk/Transport.h"

namespace qel {

// Connections to a service core on the source, of whose condition `tell` hears, from any thread.
// Nothing when there is no such source; `error` then holds an exit code and one line why.
std::shared_ptr<tesk::Connector> connectWithin(const std::string& source,
                                               tesk::bus::ConditionObserver tell,
                                               sources::SourceError& error);
// The book follows the condition.
std::shared_ptr<tesk::Connector> connectWithin(const std::string& source, FeedBook& book,
                                               sources::SourceError& error);

}  // namespace qel
