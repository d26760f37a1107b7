// The messages between network and phone (44.018).
#include <optional>

#include "sources/Metrics.h"
#include "sources/diagnostics/gsm/GsmChanges.h"
#include "sources/diagnostics/gsm/GsmLogs.h"
#include "sources/diagnostics/gsm/MeasurementReport.h"
#include "sources/diagnostics/gsm/SystemInformation.h"

namespace qel::diagnostics {
namespace {

enum Channel : std::uint8_t { kDedicated, kBroadcast, kRandomAccess, kCommon, kSlow, kStandAlone };
constexpr std::uint8_t kLastDedicated = 7;  // both fast ones are in front of it

struct Message {
  std::uint8_t channel = 0;
  std::uint8_t type = 0;
  ByteView bytes;              // from the protocol discriminator on
  std::size_t fixedBytes = 0;  // without rest octets
  std::uint64_t timeMs = 0;
};

using Take = Outcome (*)(const Message& message, Picture& picture, Told& told);

Outcome takeSystemInformation3(const Message& message, Picture& picture, Told& told) {
  const auto read = readSystemInformation3(message.bytes);
  if (!read) return Outcome::damaged;
  enterCell(picture, read->cell);
  GsmBroadcast& broadcast = picture.gsm.broadcast;
  broadcast.controlChannel = read->controlChannel;
  broadcast.options = read->options;
  broadcast.selection = read->selection;
  broadcast.access = read->access;
  broadcast.reselection = read->reselection;
  broadcast.secondList = read->secondList;
  broadcast.earlyClassmark = read->earlyClassmark;
  broadcast.packetService = read->packetService;
  told.tell(metric::kGsmScellInfo);
  told.tell(metric::kGsmIdleConfig);
  told.tell(metric::kGsmGprsConfig);
  return Outcome::understood;
}

Outcome takeSystemInformation4(const Message& message, Picture& picture, Told& told) {
  const auto read = readSystemInformation4(message.bytes, message.fixedBytes);
  if (!read) return Outcome::damaged;
  enterArea(picture, read->area);
  GsmBroadcast& broadcast = picture.gsm.broadcast;
  broadcast.selection = read->selection;
  broadcast.access = read->access;
  broadcast.cellBroadcast = read->cellBroadcast;
  broadcast.moreSelection = read->moreSelection;
  if (read->reselection) broadcast.reselection = read->reselection;
  if (read->packetService) broadcast.packetService = read->packetService;
  told.tell(metric::kGsmIdleConfig);
  told.tell(metric::kGsmGprsConfig);
  return Outcome::understood;
}

// It comes twice a second during a call: only a new cell is worth a word.
Outcome takeSystemInformation6(const Message& message, Picture& picture, Told& told) {
  const auto cell = readSystemInformation6(message.bytes);
  if (!cell) return Outcome::damaged;
  const bool isNew = picture.gsm.cell != cell;
  camp(picture, *cell);
  if (isNew) told.tell(metric::kGsmScellInfo);
  return Outcome::understood;
}

Outcome takeSystemInformation13(const Message& message, Picture& picture, Told& told) {
  const auto read = readSystemInformation13(message.bytes);
  if (!read) return Outcome::damaged;
  if (!read->rules) return Outcome::notOurs;
  picture.gsm.broadcast.packetRules = read->rules;
  told.tell(metric::kGsmGprsConfig);
  return Outcome::understood;
}

Outcome takeSecondList(const Message& message, Picture& picture, Told& told) {
  const auto reporting = readMultibandReporting(message.bytes);
  if (!reporting) return Outcome::damaged;
  picture.gsm.broadcast.multibandReporting = reporting;
  told.tell(metric::kGsmIdleConfig);
  return Outcome::understood;
}

Outcome takeMeasurementReport(const Message& message, Picture& picture, Told& told) {
  const auto read = readMeasurementReport(message.bytes);
  if (!read) return Outcome::damaged;
  if (!read->valid) return Outcome::notOurs;
  picture.gsm.callLevel = GsmCallLevel{read->rxlevSub, read->rxqualSub, message.timeMs};
  told.tell(metric::kGsmCallMeasurement);
  return Outcome::understood;
}

// Of paging and of assignments the page mode alone is read. They come many times a second: only a
// change is worth a word.
Outcome takePageMode(const Message& message, Picture& picture, Told& told) {
  constexpr std::size_t kPageMode = 2;
  if (message.bytes.size() <= kPageMode) return Outcome::damaged;
  const std::uint32_t mode = message.bytes[kPageMode] & 3U;
  auto& known = picture.gsm.broadcast.pageMode;
  if (known != mode) told.tell(metric::kGsmIdleConfig);
  known = mode;
  return Outcome::understood;
}

// After it the phone goes back to the common channels.
Outcome takeChannelRelease(const Message& /*message*/, Picture& picture, Told& told) {
  if (setDedicated(picture.gsm, false)) told.tell(metric::kGsmScellInfo);
  return Outcome::understood;
}

struct MessageRow {
  std::uint8_t type;
  std::uint8_t channel;
  Take take;
};

constexpr MessageRow kMessages[] = {
    {0x1B, kBroadcast, takeSystemInformation3},
    {0x1C, kBroadcast, takeSystemInformation4},
    {0x00, kBroadcast, takeSystemInformation13},
    {0x03, kBroadcast, takeSecondList},
    {0x1E, kSlow, takeSystemInformation6},
    {0x06, kSlow, takeSecondList},
    {0x15, kSlow, takeMeasurementReport},
    {0x21, kCommon, takePageMode},
    {0x22, kCommon, takePageMode},
    {0x24, kCommon, takePageMode},
    {0x39, kCommon, takePageMode},
    {0x3A, kCommon, takePageMode},
    {0x3F, kCommon, takePageMode},
    {0x0D, kDedicated, takeChannelRelease},
    {0x0D, kStandAlone, takeChannelRelease},
    {0x0D, 6, takeChannelRelease},
    {0x0D, kLastDedicated, takeChannelRelease},
};

// On channels for all phones, and on the slow one of a call, a length stands in front, which does
// not count the rest octets (44.006, clause 6.6).
std::optional<Message> messageOf(const LogPacket& packet) {
  constexpr std::size_t kHeadBytes = 3;
  constexpr std::uint8_t kRadioResources = 0x06;
  const ByteView body = packet.body;
  if (body.size() < kHeadBytes || body.size() - kHeadBytes < body[2]) return std::nullopt;
  const ByteView bytes = body.subspan(kHeadBytes, body[2]);
  Message message;
  message.channel = body[0] & 0x7F;
  message.timeMs = packet.timeMs;
  if (bytes.size() >= 3 && (bytes[0] & 3) == 1 && bytes[1] == kRadioResources) {
    message.bytes = bytes.subspan(1);
    message.fixedBytes = bytes[0] >> 2;
  } else if (bytes.size() >= 2 && bytes[0] == kRadioResources) {
    message.bytes = bytes;
    message.fixedBytes = bytes.size();
  }
  if (!message.bytes.empty()) message.type = message.bytes[1];
  return message;
}

}  // namespace

Outcome readGsmRadioMessage(const LogPacket& packet, Picture& picture, Told& told) {
  const auto message = messageOf(packet);
  if (!message) return Outcome::damaged;
  if (message->channel > kLastDedicated) return Outcome::notOurs;
  Outcome outcome = Outcome::notOurs;
  for (const MessageRow& row : kMessages) {
    if (message->bytes.empty() || row.type != message->type || row.channel != message->channel) {
      continue;
    }
    outcome = row.take(*message, picture, told);
  }
  if (outcome == Outcome::damaged || message->type == 0x0D) return outcome;
  const bool common = message->channel >= kBroadcast && message->channel <= kCommon;
  if (setDedicated(picture.gsm, !common)) told.tell(metric::kGsmScellInfo);
  return outcome;
}

}  // namespace qel::diagnostics
