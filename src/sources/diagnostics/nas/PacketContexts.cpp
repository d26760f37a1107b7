#include "sources/diagnostics/nas/PacketContexts.h"

#include <algorithm>

#include "sources/Metrics.h"

namespace qel::diagnostics {
namespace {

using Context = ContextsPart::Context;

void dropConnection(std::uint32_t nsapi, Picture& picture, Told& told) {
  auto& active = picture.nas.connections.active;
  if (!active) return;
  const auto dropped = std::erase_if(
      *active, [&](const PacketConnection& connection) { return connection.nsapi == nsapi; });
  if (dropped != 0) told.tell(metric::kBearers);
}

}  // namespace

void askForContext(std::uint32_t transaction, PacketConnection connection, Picture& picture) {
  auto& contexts = picture.nas.contexts.contexts;
  std::erase_if(contexts, [&](const Context& context) {
    return context.transaction == transaction && !context.active;
  });
  if (contexts.size() >= ContextsPart::kMost) contexts.erase(contexts.begin());
  contexts.push_back({transaction, false, std::move(connection)});
}

void activateContext(std::uint32_t transaction, ActivateAccept accept, Picture& picture,
                     Told& told) {
  auto& contexts = picture.nas.contexts.contexts;
  const auto asked = std::ranges::find_if(contexts, [&](const Context& context) {
    return context.transaction == transaction && !context.active;
  });
  if (asked == contexts.end()) return;
  Context granted = *asked;
  if (accept.type) granted.connection.type = accept.type;
  granted.connection.address = std::move(accept.address);
  granted.connection.nameServers = std::move(accept.nameServers);
  granted.active = true;
  // What had this number before is over, even if its end was not seen.
  std::erase_if(contexts, [&](const Context& context) {
    return context.transaction == transaction ||
           context.connection.nsapi == granted.connection.nsapi;
  });
  contexts.push_back(granted);
  dropConnection(granted.connection.nsapi, picture, told);
  auto& active = picture.nas.connections.active;
  if (!active) active.emplace();
  active->push_back(granted.connection);
  told.tell(metric::kBearers);
}

void endContext(std::uint32_t transaction, Picture& picture, Told& told) {
  auto& contexts = picture.nas.contexts.contexts;
  for (const Context& context : contexts) {
    if (context.transaction == transaction && context.active) {
      dropConnection(context.connection.nsapi, picture, told);
    }
  }
  std::erase_if(contexts,
                [&](const Context& context) { return context.transaction == transaction; });
}

void endAllContexts(Picture& picture, Told& told) {
  for (const Context& context : picture.nas.contexts.contexts) {
    if (context.active) dropConnection(context.connection.nsapi, picture, told);
  }
  picture.nas.contexts.contexts.clear();
}

}  // namespace qel::diagnostics
