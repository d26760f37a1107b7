#include "PhoneMix.h"

#include <array>
#include <memory>
#include <random>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/wcdma.h"

namespace qel::bench {
namespace {

// A source of numbers that gives the same ones on every machine.
class Dice {
 public:
  std::uint32_t below(std::uint32_t end) { return static_cast<std::uint32_t>(_engine() % end); }
  std::int32_t between(std::int32_t low, std::int32_t high) {
    return low + static_cast<std::int32_t>(below(static_cast<std::uint32_t>(high - low + 1)));
  }

 private:
  std::mt19937 _engine{20170714};
};

template <class Message>
Message stamped(std::uint64_t time) {
  Message message;
  message.setTimestamp(time);
  return message;
}

std::shared_ptr<RsrpRsrqSinr> signal(Dice& dice) {
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setPhyCellId(dice.below(504));
  values->setRsrp0(dice.between(-130, -70));
  values->setRsrp1(dice.between(-130, -70));
  values->setRsrq0(dice.between(-19, -3));
  values->setRsrq1(dice.between(-19, -3));
  values->setSinr0(dice.between(-20, 60));
  values->setSinr1(dice.between(-20, 60));
  return values;
}

Bytes signalReport(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteRsrpRsrqSinr>(time);
  report.setLastXSeconds(5);
  report.setLastYSamples(10);
  report.setSamplePeriodMs(500);
  report.setDurationMs(5000);
  report.setNumSamples(10);
  report.setAvgValues(signal(dice));
  const std::uint32_t count = 1 + dice.below(3);
  for (std::uint32_t i = 0; i < count; ++i) report.addInstValues(signal(dice));
  return report.data();
}

Bytes txPower(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteTxPower>(time);
  const std::uint32_t count = 4 + dice.below(5);
  for (std::uint32_t i = 0; i < count; ++i) {
    auto info = std::make_shared<TxPowerInfo>();
    info->setPucchTxPower(dice.between(-30, 23));
    info->setPuschTxPower(dice.between(-30, 23));
    info->setSubframeIndex(dice.below(10));
    report.addTxPowerInfo(std::move(info));
  }
  return report.data();
}

Bytes neighbours(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteNbrEutraCellMeas>(time);
  const std::uint32_t count = 2 + dice.below(5);
  for (std::uint32_t i = 0; i < count; ++i) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(1300);
    cell->setNbrPhysCellId(dice.below(504));
    cell->setFreqBandInd(3);
    cell->setNbrRsrp(dice.between(10, 70));
    cell->setNbrRsrq(dice.between(0, 30));
    report.addMeasNbrEutra(std::move(cell));
  }
  return report.data();
}

Bytes rrcState(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteRrcState>(time);
  report.setState(dice.between(1, 4));
  report.setPrevState(dice.between(1, 4));
  report.setPrevStateDurMs(dice.below(60000));
  report.setCause(dice.between(2, 15));
  return report.data();
}

Bytes servingCell(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteScellInfo>(time);
  report.setPhyCellId(dice.below(504));
  report.setDlFreq(1300);
  report.setUlFreq(19300);
  report.setDlBw(5);
  report.setUlBw(5);
  report.setCellId(dice.below(1 << 28));
  report.setFreqBandInd(3);
  report.setTrackingAreaCode(dice.below(65536));
  report.setNumMncDigits(2);
  report.setSelPlmnMcc(1);
  report.setSelPlmnMnc(1);
  return report.data();
}

Bytes reselection(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularLteSelReselCellInfo>(time);
  for (const std::uint32_t band : {1U, 3U, 7U, 20U}) report.addMultiBandInfo(band);
  report.setQRxLevMin(-124);
  report.setQHyst(4);
  report.setSNonIntraSearchP(20);
  report.setSIntraSearchP(62);
  report.setThreshServingLowP(8);
  report.setPriorityOperatingFreq(5);
  for (int i = 0; i < 3; ++i) {
    auto neighbour = std::make_shared<NbrEutra>();
    neighbour->setEarfcn(1300 + dice.below(2000));
    neighbour->setQRxlevMin(-120);
    neighbour->setDlBw(dice.below(6));
    neighbour->setPriority(dice.below(8));
    neighbour->setFrameType(0);
    report.addNbrEutra(std::move(neighbour));
  }
  return report.data();
}

Bytes emmContext(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularEmmContext>(time);
  report.setRegStatus(0);
  report.setUpdateStatus(0);
  auto area = std::make_shared<KCellularTrackingAreaId>();
  area->setEncodedPlmn(Bytes{0x00, 0xF1, 0x10});
  area->setTac(dice.below(65536));
  report.addTaiList(std::move(area));
  auto guti = std::make_shared<Guti>();
  guti->setMmegi(dice.below(65536));
  guti->setMmec(dice.below(256));
  guti->setMTmsi(dice.below(0xFFFFFFFF));
  report.setGuti(std::move(guti));
  report.setT3412DurS(3240);
  return report.data();
}

Bytes bearers(Dice& dice, std::uint64_t time) {
  auto report = stamped<KCellularActivatedBearerContexts>(time);
  report.setBearerContextCount(1);
  auto bearer = std::make_shared<BearerContext>();
  bearer->setCid(dice.below(4));
  bearer->setApn("internet.example");
  bearer->setPdpType(2);
  bearer->setPdpAddr(Bytes{192, 0, 2, 17});
  report.addBearerContexts(std::move(bearer));
  return report.data();
}

struct Kind {
  std::uint32_t metric;
  std::uint32_t percent;
  Bytes (*make)(Dice& dice, std::uint64_t time);
};

constexpr std::array kKinds = {
    Kind{20330, 40, signalReport}, Kind{54018, 20, txPower},    Kind{54031, 18, neighbours},
    Kind{19972, 12, rrcState},     Kind{16578, 4, servingCell}, Kind{54030, 2, reselection},
    Kind{54540, 2, emmContext},    Kind{54541, 2, bearers},
};

const Kind& draw(Dice& dice) {
  std::uint32_t roll = dice.below(100);
  for (const Kind& kind : kKinds) {
    if (roll < kind.percent) return kind;
    roll -= kind.percent;
  }
  return kKinds.front();
}

}  // namespace

std::vector<Payload> phoneMix(std::size_t count) {
  Dice dice;
  std::vector<Payload> payloads;
  payloads.reserve(count);
  std::uint64_t time = kMixStartMs;
  while (payloads.size() < count) {
    const Kind& kind = draw(dice);
    payloads.push_back({kind.metric, kind.make(dice, time)});
    time += kMixStepMs;
  }
  return payloads;
}

}  // namespace qel::bench
