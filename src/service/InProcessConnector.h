// The service within the client's own process.
#pragma once

#include <memory>
#include <string>

#include "service/ServiceCore.h"
#include "sources/SourceError.h"
#include "tesk/Transport.h"

namespace qel::service {

// The core on a source, named as for parseSourceChoice. Nothing when there is no such source;
// `error` then holds an exit code and one line why. With a keeper, configurations outlive the core.
std::shared_ptr<ServiceCore> makeServiceCore(const std::string& sourceText,
                                             sources::SourceError& error,
                                             std::unique_ptr<StateKeeper> keeper = nullptr);

// Connections straight to the core. Sinks run on the source's thread, or in a query on the
// caller's; a transport may be destroyed from within its own sink.
std::shared_ptr<tesk::Connector> makeInProcessConnector(std::shared_ptr<ServiceCore> core);

// Both in one.
std::shared_ptr<tesk::Connector> makeInProcessConnector(const std::string& sourceText,
                                                        sources::SourceError& error);

}  // namespace qel::service
