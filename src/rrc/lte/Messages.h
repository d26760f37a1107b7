// LTE's RRC messages (36.331), as far as they are of use here: from a message's bits its values.
#pragma once

#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "rrc/lte/Channel.h"
#include "rrc/lte/Connection.h"
#include "rrc/lte/SystemInformation.h"

namespace qel::rrc::lte {

// Which message it was, and what was read of it: nothing more than `kind` for most.
struct Message {
  Kind kind = Kind::other;

  std::optional<MasterInformationBlock> mib;
  std::optional<Sib1> sib1;
  std::optional<Sib2> sib2;
  std::optional<Sib3> sib3;
  std::optional<Sib5> sib5;
  std::optional<Sib6> sib6;
  std::optional<Sib7> sib7;

  std::optional<ConnectionRequest> request;
  std::optional<ReestablishmentRequest> reestablishmentRequest;
  std::optional<RadioConfiguration> radio;  // of setup, reconfiguration, re-establishment, resume
  std::optional<Reconfiguration> reconfiguration;
  std::optional<ConnectionRelease> release;
  std::optional<MobilityFromEutra> mobility;
  std::optional<MeasurementReport> report;

  std::vector<Bytes> nas;  // messages of the non-access stratum that it carries

  bool operator==(const Message&) const = default;
};

}  // namespace qel::rrc::lte

namespace qel::rrc {

using LteChannel = lte::Channel;
using LteMessage = lte::Message;

// Any thread. Nothing when the bits are no message of that channel. What stands behind the part
// that is read, and extensions that are newer than the schema, are passed over.
std::optional<LteMessage> readLteMessage(LteChannel channel, ByteView pdu);

}  // namespace qel::rrc
