#include "sources/diagnostics/nas/EsmLogs.h"

#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/EsmMessage.h"
#include "sources/diagnostics/nas/PlainMessage.h"

namespace qel::diagnostics {
namespace {

Outcome lookAtLength(ByteView body, std::size_t length) {
  constexpr std::uint8_t kVersion = 1;
  if (body.empty()) return Outcome::damaged;
  if (body[0] != kVersion) return Outcome::unknownVersion;
  return body.size() < length ? Outcome::damaged : Outcome::notOurs;
}

}  // namespace

Outcome readEsmMessages(const LogPacket& packet, Picture& picture, Told& told) {
  const PlainMessage plain = plainMessage(packet.body);
  if (plain.outcome != Outcome::understood) return plain.outcome;
  const auto message = readEsmMessage(plain.bytes);
  if (!message) return Outcome::damaged;
  if (message->type == EsmType::other) return Outcome::notOurs;
  auto& active = picture.nas.connections.active;
  const bool begins = message->type == EsmType::activateRequest;
  if (begins && !active) active.emplace();
  if (!active) return Outcome::understood;
  // A dedicated bearer belongs to a connection that is in the list.
  const auto ended = std::erase_if(*active, [&](const PacketConnection& connection) {
    return connection.nsapi == message->bearer;
  });
  if (begins) active->push_back(message->connection);
  if (begins || ended != 0) told.tell(metric::kBearers);
  return Outcome::understood;
}

Outcome readBearerState(const LogPacket& packet, Picture& /*picture*/, Told& /*told*/) {
  return lookAtLength(packet.body, 4);
}

Outcome readBearerContext(const LogPacket& packet, Picture& /*picture*/, Told& /*told*/) {
  return lookAtLength(packet.body, 20);
}

}  // namespace qel::diagnostics
