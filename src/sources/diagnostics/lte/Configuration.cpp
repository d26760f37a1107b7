#include "sources/diagnostics/lte/Configuration.h"

#include <algorithm>

#include "radio/Bands.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/lte/Bandwidth.h"

namespace qel::diagnostics {
namespace {

using rrc::lte::Kind;
using rrc::lte::MeasurementConfiguration;
using rrc::lte::MeasurementObject;
using rrc::lte::RadioConfiguration;
using rrc::lte::Reconfiguration;
using rrc::lte::SecondaryCell;

// A connection begins with antennas as they are; that alone is nothing new to be told.
void takeReception(const RadioConfiguration& radio, bool begins, Picture& picture, Told& told) {
  LteReception& reception = picture.lte.connection.reception;
  if (radio.defaultTransmissionMode) reception.transmissionMode.reset();
  if (!radio.drx && !radio.transmissionMode) return;
  reception.configured = true;
  if (radio.drx) reception.drx = radio.drx->setup;
  if (radio.transmissionMode) reception.transmissionMode = radio.transmissionMode;
  if (radio.drx || !begins) told.tell(metric::kLteCdrxConfig);
}

std::optional<std::uint32_t> codeOf(const std::optional<unsigned>& blocks) {
  return blocks ? bandwidthCode(*blocks) : std::nullopt;
}

std::optional<std::uint32_t> bandOf(const std::optional<std::uint32_t>& earfcn) {
  return earfcn ? lteBandOf(*earfcn) : std::nullopt;
}

SecondaryCarrier carrierOf(const SecondaryCell& cell) {
  SecondaryCarrier carrier;
  carrier.index = cell.index;
  carrier.pci = cell.pci;
  carrier.earfcn = cell.dlEarfcn;
  carrier.band = bandOf(cell.dlEarfcn);
  carrier.bandwidth = codeOf(cell.dlBandwidthBlocks);
  carrier.hasUplink = cell.uplink;
  if (cell.uplink) {
    carrier.ulEarfcn = cell.ulEarfcn;
    // The carrier's own uplink is in its own band.
    carrier.ulBand = carrier.band;
    carrier.ulBandwidth = codeOf(cell.ulBandwidthBlocks);
  }
  return carrier;
}

void takeCarriers(const Reconfiguration& change, Picture& picture, Told& told) {
  constexpr std::size_t kMost = 31;  // indices (36.331, clause 6.4)
  auto& carriers = picture.lte.carriers;
  const bool had = !carriers.empty();
  if (change.fullConfiguration) carriers.clear();
  for (const unsigned index : change.removedSecondaryCells) {
    std::erase_if(carriers, [&](const SecondaryCarrier& known) { return known.index == index; });
  }
  for (const SecondaryCell& cell : change.secondaryCells) {
    const auto known = std::ranges::find(carriers, cell.index, &SecondaryCarrier::index);
    if (known == carriers.end()) {
      if (carriers.size() < kMost) carriers.push_back(carrierOf(cell));
    } else if (cell.pci) {  // else it is changed in what is not of interest here
      *known = carrierOf(cell);
    }
  }
  std::ranges::sort(carriers, {}, &SecondaryCarrier::index);
  const bool isReleased = change.fullConfiguration && had;
  if (!isReleased && change.removedSecondaryCells.empty() && change.secondaryCells.empty()) return;
  picture.lte.carriersTold = true;
  told.tell(metric::kLteCarrierAggregation);
  told.tell(metric::kLteComponentCarriers);
}

// Where the phone goes to another frequency, what was meant for the one is now meant for the other
// (36.331, clause 5.5.6.1).
void followHandover(const rrc::lte::Handover& handover, Picture& picture) {
  LteMeasuring& measuring = picture.lte.connection.measuring;
  const auto& camped = picture.lte.camped;
  const std::uint32_t source = camped ? camped->earfcn : handover.dlEarfcn.value_or(0);
  const std::uint32_t target = handover.dlEarfcn.value_or(source);
  const auto objectOn = [&](std::uint32_t earfcn) -> std::optional<unsigned> {
    for (const auto& object : measuring.objects) {
      if (object && object->technology == rrc::lte::Target::eutra && object->carrier == earfcn) {
        return object->id;
      }
    }
    return std::nullopt;
  };
  if (source != target) {
    const auto from = objectOn(source);
    const auto to = objectOn(target);
    for (auto& object : measuring.objectOf) {
      if (object && object == from) {
        object = to;
      } else if (object && object == to) {
        object = from;
      }
    }
  }
  if (camped || handover.dlEarfcn) picture.lte.camp({target, handover.pci});
}

void takeMeasurements(const MeasurementConfiguration& change, LteMeasuring& measuring) {
  const auto isIdentity = [](unsigned id) { return id < LteMeasuring::kIdentities; };
  for (const unsigned id : change.removedObjects) {
    if (!isIdentity(id)) continue;
    measuring.objects[id].reset();
    for (auto& object : measuring.objectOf) {
      if (object == id) object.reset();
    }
  }
  for (const MeasurementObject& object : change.objects) {
    if (isIdentity(object.id)) measuring.objects[object.id] = object;
  }
  for (const unsigned id : change.removedIdentities) {
    if (isIdentity(id)) measuring.objectOf[id].reset();
  }
  for (const auto& identity : change.identities) {
    if (isIdentity(identity.id)) measuring.objectOf[identity.id] = identity.object;
  }
}

void takeReconfiguration(const Reconfiguration& change, Picture& picture, Told& told) {
  LteConnection& connection = picture.lte.connection;
  if (change.fullConfiguration) {
    connection.reception = {};
    connection.measuring = {};
  }
  if (change.handover) followHandover(*change.handover, picture);
  takeCarriers(change, picture, told);
  if (change.measurements) takeMeasurements(*change.measurements, connection.measuring);
}

}  // namespace

void takeConfiguration(const rrc::LteMessage& message, std::uint64_t timeMs, Picture& picture,
                       Told& told) {
  LteConnection& connection = picture.lte.connection;
  const bool begins = message.kind == Kind::rrcConnectionSetup;
  if (begins) connection.reception = {};
  if (message.reconfiguration) takeReconfiguration(*message.reconfiguration, picture, told);
  if (message.radio) takeReception(*message.radio, begins, picture, told);
  if (message.reconfiguration || message.radio) connection.configuredMs = timeMs;
}

}  // namespace qel::diagnostics
