// The messages of the air interface: 0x412F.
#include "rrc/umts/Broadcast.h"
#include "rrc/umts/Messages.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/umts/UmtsAssembly.h"
#include "sources/diagnostics/umts/UmtsBlocks.h"
#include "sources/diagnostics/umts/UmtsConnectionSteps.h"
#include "sources/diagnostics/umts/UmtsReaders.h"

namespace qel::diagnostics {
namespace {

using rrc::umts::Channel;

// What a modem has on its channels; the higher numbers have the cell in front of the message.
constexpr unsigned kUlCcch = 0;
constexpr unsigned kDlCcch = 2;
constexpr unsigned kDlDcch = 3;
constexpr unsigned kBroadcast = 4;
constexpr unsigned kLastPlain = 8;
constexpr unsigned kBlock = 9;  // these have a block's type in front of it
constexpr unsigned kNewerBlock = 0xFE;
constexpr unsigned kOtherBlock = 0xFF;
constexpr unsigned kWithCell = 0x80;
constexpr unsigned kBlockWithCell = 0x89;
constexpr unsigned kNewerBlockWithCell = 0xF0;

constexpr std::size_t kHead = 4;
constexpr std::size_t kCell = 4;  // UARFCN and scrambling code

struct LoggedMessage {
  unsigned channel = 0;
  ByteView message;
};

bool hasCell(unsigned channel) {
  return (channel >= kWithCell && channel <= kBlockWithCell) || channel == kNewerBlockWithCell;
}

// The same channel without a cell.
unsigned plain(unsigned channel) {
  const bool block = channel == kBlock || channel == kNewerBlock || channel == kOtherBlock ||
                     channel == kBlockWithCell || channel == kNewerBlockWithCell;
  if (block) return kBlock;
  return channel >= kWithCell && channel <= kWithCell + kLastPlain ? channel - kWithCell : channel;
}

// The length counts what stands behind it, with the cell or without.
std::optional<LoggedMessage> messageIn(ByteView body) {
  if (body.size() < kHead) return std::nullopt;
  const unsigned channel = body[0];
  const std::size_t length = u16At(body, 2);
  const std::size_t before = kHead + (hasCell(channel) ? kCell : 0);
  if (body.size() < before) return std::nullopt;
  if (body.size() != kHead + length && body.size() != before + length) return std::nullopt;
  return LoggedMessage{plain(channel), body.subspan(before)};
}

std::uint32_t rejectionOf(rrc::umts::RejectionCause cause) {
  constexpr std::uint32_t kCongestion = 16;
  constexpr std::uint32_t kUnspecified = 17;
  return cause == rrc::umts::RejectionCause::congestion ? kCongestion : kUnspecified;
}

std::uint32_t releaseOf(rrc::umts::ReleaseCause cause) {
  constexpr std::uint32_t kOther = 0;
  constexpr std::uint32_t kInactive = 3;
  constexpr std::uint32_t kNormal = 4;
  switch (cause) {
    case rrc::umts::ReleaseCause::normalEvent:
      return kNormal;
    case rrc::umts::ReleaseCause::userInactivity:
      return kInactive;
    default:
      return kOther;
  }
}

// Messages of other phones may be heard on the common channel: what ends a connection counts only
// when there is one, or when one was asked for.
bool apply(const rrc::umts::Message& message, UmtsConnection& connection) {
  constexpr unsigned kLastCause = 22;
  const bool asked = connection.state == UmtsState::establish;
  if (const auto cause = message.establishmentCause) {
    enter(UmtsState::establish, connection);
    connection.releaseCause.reset();
    connection.establishmentCause.reset();
    if (*cause <= kLastCause) connection.establishmentCause = *cause;
    return true;
  }
  if (message.rejectionCause && asked) {
    connection.releaseCause = rejectionOf(*message.rejectionCause);
    return true;
  }
  if (message.releaseCause && (asked || connection.connected().value_or(false))) {
    enter(UmtsState::release, connection);
    connection.releaseCause = releaseOf(*message.releaseCause);
    return true;
  }
  return false;
}

Outcome readConnection(Channel channel, ByteView message, Picture& picture, Told& told) {
  const auto read = rrc::readUmtsMessage(channel, message);
  if (!read) return Outcome::damaged;
  if (apply(*read, picture.umts.connection)) told.tell(metric::kUmtsRrcState);
  return Outcome::understood;
}

Outcome readBroadcast(const LogPacket& packet, ByteView message, Picture& picture, Told& told) {
  const auto block = rrc::umts::readBroadcastBlock(message);
  if (!block) return Outcome::damaged;
  Outcome outcome = Outcome::understood;
  assemble(*block, message, packet.timeMs, picture.umts.segments,
           [&](unsigned type, ByteView whole) {
             if (readUmtsBlock(type, whole, packet.timeMs, picture, told) == Outcome::damaged)
               outcome = Outcome::damaged;
           });
  return outcome;
}

}  // namespace

Outcome readUmtsRrcMessage(const LogPacket& packet, Picture& picture, Told& told) {
  const auto logged = messageIn(packet.body);
  if (!logged) return Outcome::damaged;
  const ByteView message = logged->message;
  switch (logged->channel) {
    case kUlCcch:
      return readConnection(Channel::ulCcch, message, picture, told);
    case kDlCcch:
      return readConnection(Channel::dlCcch, message, picture, told);
    case kDlDcch:
      return readConnection(Channel::dlDcch, message, picture, told);
    case kBroadcast:
      return readBroadcast(packet, message, picture, told);
    case kBlock:
      if (message.empty()) return Outcome::damaged;
      return readUmtsBlock(message[0], message.subspan(1), packet.timeMs, picture, told);
    default:
      return Outcome::notOurs;
  }
}

}  // namespace qel::diagnostics
