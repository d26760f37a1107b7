// What a phone is to measure, and what it reports.

#include <array>

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"

namespace qel::rrc::lte {
namespace {

// In the order of the alternatives, with those that were added.
constexpr std::array kTechnologies = {Target::eutra,    Target::utra, Target::geran,
                                      Target::cdma2000, Target::wlan, Target::nr};

std::optional<MeasurementObject> objectFrom(const Node& element) {
  const Node node = element[mark::measObject];
  const auto index = static_cast<std::size_t>(node.index().value_or(0));
  if (index >= kTechnologies.size()) return std::nullopt;
  MeasurementObject object;
  object.technology = kTechnologies[index];
  take(element[mark::measObjectId], object.id);
  take(node[mark::carrierFreq], object.carrier);
  take(node[mark::startingARFCN], object.carrier);
  return object;
}

EutraResult eutraFrom(const Node& node) {
  EutraResult result;
  take(node[mark::physCellId], result.pci);
  take(node[mark::rsrpResult], result.rsrp);
  take(node[mark::rsrqResult], result.rsrq);
  return result;
}

UtraResult utraFrom(const Node& node) {
  UtraResult result;
  const Node cell = node[mark::physCellId];
  result.fdd = cell.index() == 0;
  take(cell.first(), result.cell);
  take(node[mark::utraRSCP], result.rscp);
  take(node[mark::utraEcN0], result.ecn0);
  return result;
}

GeranResult geranFrom(const Node& node) {
  GeranResult result;
  take(node[mark::arfcn], result.arfcn);
  result.pcs1900 = node[mark::bandIndicator].index() == 1;
  take(node[mark::networkColourCode], result.networkColour);
  take(node[mark::baseStationColourCode], result.stationColour);
  take(node[mark::rssi], result.rssi);
  return result;
}

ServingResult servingFrom(const Node& node) {
  ServingResult result;
  take(node[mark::servFreqIdR10], result.index);
  take(node[mark::rsrpResultSCellR10], result.rsrp);
  take(node[mark::rsrqResultSCellR10], result.rsrq);
  if (const Node best = node[mark::measResultBestNeighCellR10]) {
    result.bestNeighbour.emplace();
    take(best[mark::physCellIdR10], result.bestNeighbour->pci);
    take(best[mark::rsrpResultNCellR10], result.bestNeighbour->rsrp);
    take(best[mark::rsrqResultNCellR10], result.bestNeighbour->rsrq);
  }
  return result;
}

}  // namespace

MeasurementConfiguration measurementsFrom(const Node& node) {
  MeasurementConfiguration result;
  std::vector<std::optional<MeasurementObject>> objects;
  node[mark::measObjectToAddModList].each(
      [&](const Node& element) { objects.push_back(objectFrom(element)); });
  std::size_t place = 0;
  node[mark::measObjectToAddModListV9e0].each([&](const Node& element) {
    if (place < objects.size() && objects[place]) {
      take(element[mark::carrierFreqV9e0], objects[place]->carrier);
    }
    ++place;
  });
  for (const auto& object : objects) {
    if (object) result.objects.push_back(*object);
  }

  const auto append = [](std::vector<unsigned>& to, const std::vector<unsigned>& from) {
    to.insert(to.end(), from.begin(), from.end());
  };
  append(result.removedObjects, numbersOf(node[mark::measObjectToRemoveList]));
  append(result.removedIdentities, numbersOf(node[mark::measIdToRemoveList]));
  append(result.removedIdentities, numbersOf(node[mark::measIdToRemoveListExtR12]));
  node[mark::measIdToAddModList].each([&](const Node& element) {
    MeasurementIdentity& identity = result.identities.emplace_back();
    take(element[mark::measId], identity.id);
    take(element[mark::measObjectId], identity.object);
  });
  node[mark::measIdToAddModListExtR12].each([&](const Node& element) {
    MeasurementIdentity& identity = result.identities.emplace_back();
    take(element[mark::measIdV1250], identity.id);
    take(element[mark::measObjectIdR12], identity.object);
  });
  return result;
}

std::optional<MeasurementReport> reportFrom(const Node& message) {
  const Node serving = message[mark::measResultPCell];
  if (!serving) return std::nullopt;
  MeasurementReport report;
  take(message[mark::measId], report.id);
  take(message[mark::measIdV1250], report.id);
  take(serving[mark::rsrpResult], report.rsrp);
  take(serving[mark::rsrqResult], report.rsrq);
  message[mark::measResultListEUTRA].each(
      [&](const Node& element) { report.eutra.push_back(eutraFrom(element)); });
  message[mark::measResultListUTRA].each(
      [&](const Node& element) { report.utra.push_back(utraFrom(element)); });
  message[mark::measResultListGERAN].each(
      [&](const Node& element) { report.geran.push_back(geranFrom(element)); });
  message[mark::measResultServFreqListR10].each(
      [&](const Node& element) { report.secondaryCells.push_back(servingFrom(element)); });
  return report;
}

}  // namespace qel::rrc::lte
