// What the phone reports on GSM.
#include "messages/gsm.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Bands.h"
#include "sources/simulated/Random.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostNeighbours = 6;
constexpr std::uint32_t kLeastRxlev = 4;         // of the cells: -106 dBm
constexpr std::uint32_t kHighestPowerLevel = 5;  // 33 dBm (45.005, clause 4.1.1)
constexpr int kMostGsmPowerDbm = 33;
constexpr int kLeastGsmPowerDbm = 5;
constexpr std::uint32_t kPowerSamples = 4;

bool dedicated(const PhoneView& view) { return view.phone.connection().gsmDedicated(); }

// The phone sends with less where it is heard well, in steps of 2 dB.
std::int32_t powerDbm(double levelDbm) {
  const int wanted = rounded(-62 - levelDbm);
  const int stepped = wanted / 2 * 2 + 1;
  return std::clamp(stepped, kLeastGsmPowerDbm, kMostGsmPowerDbm);
}

// Bit errors by level (45.008, clause 8.2.4): good down to some -95 dBm.
std::uint32_t qualityOf(double levelDbm) { return index((-95 - levelDbm) / 2, 7); }

void addGsm(const PhoneView& view, KCellularGsmGrrEventMeasCr& message) {
  for (const std::size_t cell : neighbours(view, Technology::gsm, kMostNeighbours)) {
    auto entry = makeMessage<GsmNcellMeas>();
    entry->setMcc(kMcc);
    entry->setMnc(kMnc);
    entry->setLac(cells()[cell].area);
    entry->setCi(cells()[cell].cellId);
    entry->setBsic(cells()[cell].code);
    entry->setArfcn(cells()[cell].channel);
    entry->setRxlev(rxlevIndex(view.scene.of(cell).levelDbm));
    message.addGsmNcellMeas(entry);
  }
}

void addUmts(const PhoneView& view, KCellularGsmGrrEventMeasCr& message) {
  for (const std::size_t cell : neighbours(view, Technology::umts, kMostNeighbours)) {
    auto entry = makeMessage<UmtsNcellMeas>();
    entry->setCellType(0);
    entry->setCpichSc(cells()[cell].code);
    entry->setDlUarfcn(cells()[cell].channel);
    entry->setCpichRscp(rscpIndex(view.scene.of(cell).levelDbm));
    entry->setCpichEcn0(ecnoIndex(view.scene.of(cell).qualityDb));
    message.addUmtsNcellMeas(entry);
  }
}

void addLte(const PhoneView& view, KCellularGsmGrrEventMeasCr& message) {
  for (const std::size_t cell : neighbours(view, Technology::lte, kMostNeighbours)) {
    auto entry = makeMessage<LteNcellMeas>();
    entry->setPhysicalCellId(cells()[cell].code);
    entry->setBandwidth(layerOf(cells()[cell]).bandwidthCode);
    entry->setRsrp(rsrpIndex(view.scene.of(cell).levelDbm));
    entry->setEarfcn(cells()[cell].channel);
    entry->setRsrq(rsrqIndex(view.scene.of(cell).qualityDb));
    message.addLteNcellMeas(entry);
  }
}

}  // namespace

std::optional<Bytes> gsmScellInfo(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm)) return std::nullopt;
  const Cell& cell = view.cell();
  KCellularGsmScellInfo message;
  message.setTimestamp(timeMs);
  message.setMcc(kMcc);
  message.setMnc(kMnc);
  message.setLac(cell.area);
  message.setCellId(cell.cellId);
  message.setGsmBand(kGsm900E);
  message.setArfcn(cell.channel);
  message.setBsic(cell.code);
  message.setState(dedicated(view) ? kGsmDedicated : kGsmNotDedicated);
  message.setNumMncDigits(kMncDigits);
  return message.data();
}

// The reselection offset is not broadcast here: its field, 19, is one that no receiver can read.
std::optional<Bytes> gsmIdleConfig(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm)) return std::nullopt;
  const Cell& cell = view.cell();
  KCellularGsmIdleConfig message;
  message.setTimestamp(timeMs);
  message.setArfcnBcch(cell.channel);
  message.setMcc(kMcc);
  message.setMnc(kMnc);
  message.setLac(cell.area);
  message.setCi(cell.cellId);
  message.setBsic(cell.code);
  message.setDtxFromBs(1);
  message.setRadioLinkTimeout(24);
  message.setMultibRep(0);
  message.setGsmBand(kGsm900E);
  message.setAccessTech(0);
  message.setTypeOfCurChan(0);
  message.setMsTxpwr(kHighestPowerLevel);
  message.setRxAccMin(kLeastRxlev);
  message.setCbq(0);
  message.setCba(0);
  message.setC2Valid(1);
  message.setTmpOffset(0);
  message.setPenaltyT(20);
  message.setT3212(10);  // an hour
  message.setAcc(0);
  message.setBsPaMfrms(5);
  message.setCsPagemode(0);
  message.setMaxRetransCs(4);
  message.setEmergCallAllowed(1);
  message.setAttachAllowed(1);
  message.setHalfRateSupported(1);
  message.setSi78Broadcast(0);
  message.setCbchSupported(0);
  message.setReestAllowed(1);
  message.setEcsc(1);
  message.setSi2TerNeeded(0);
  return message.data();
}

std::optional<Bytes> gsmIdleMeasurement(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm) || dedicated(view)) return std::nullopt;
  KCellularGsmIdleScellMeasurement message;
  message.setTimestamp(timeMs);
  message.setScellArfcn(view.cell().channel);
  message.setSimplifiedL1State(1);
  message.setCurrentAntenna(0);
  message.setIdleRxlevDBm(rounded(view.signal().antennaDbm[0]));
  return message.data();
}

std::optional<Bytes> gsmCallMeasurement(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm) || !dedicated(view)) return std::nullopt;
  const double levelDbm = view.signal().antennaDbm[0];
  KCellularGsmCsRfMeasurement message;
  message.setTimestamp(timeMs);
  message.setScellArfcn(view.cell().channel);
  message.setSimplifiedL1State(4);
  message.setCurrentAntenna(0);
  for (std::uint32_t i = 0; i < kPowerSamples; ++i) {
    message.addCsTxPwr(powerDbm(levelDbm + normalOf(scramble(timeMs, i))));
  }
  message.setCsRxlevSub(rxlevIndex(levelDbm));
  message.setCsRxqualSub(qualityOf(levelDbm));
  message.setScellBand(kGsm900E);
  return message.data();
}

std::optional<Bytes> gsmGprsConfig(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm)) return std::nullopt;
  KCellularGsmGprsConfig message;
  message.setTimestamp(timeMs);
  message.setGprsSup(true);
  message.setRac(view.cell().routingArea);
  message.setSpPgCy(false);
  message.setNco(0);
  message.setNom(1);
  message.setCrHyst(6);
  message.setAccThr(6);
  message.setExtUplTbfSupported(true);
  message.setPriorityClass(0);
  message.setCellBarAccess2(0);
  return message.data();
}

std::optional<Bytes> gsmNeighbours(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::gsm)) return std::nullopt;
  KCellularGsmGrrEventMeasCr message;
  message.setTimestamp(timeMs);
  addGsm(view, message);
  addUmts(view, message);
  addLte(view, message);
  return message.data();
}

}  // namespace qel::sources
