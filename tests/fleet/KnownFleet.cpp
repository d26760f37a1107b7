#include "fleet/KnownFleet.h"

#include "fleet/MetricNames.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "recording/EventLine.h"

namespace qel::testing {
namespace {

using V = MetricValidator;

constexpr std::int32_t kIdle = 1;
constexpr std::int32_t kConnected = 3;

class Phone {
 public:
  Phone(std::string name, std::int64_t startS, std::vector<PhoneMessages>& sent)
      : _name(std::move(name)), _startS(startS), _sent(sent) {}

  void cell(std::int64_t afterS, std::uint32_t pci) {
    KCellularLteScellInfo message;
    message.setPhyCellId(pci);
    message.setDlFreq(1300);
    message.setCellId(1000 + pci);
    send(afterS, V::K_LTE_SCELL_INFO, message);
  }
  void state(std::int64_t afterS, std::int32_t state) {
    KCellularLteRrcState message;
    message.setState(state);
    message.setPrevState(state == kConnected ? kIdle : kConnected);
    message.setPrevStateDurMs(320);
    message.setCause(state == kConnected ? 4 : 15);
    send(afterS, V::K_LTE_RRC_STATE, message);
  }
  // With two samples, which make two rows of one report.
  void signal(std::int64_t afterS, std::int32_t rsrp) {
    auto average = std::make_shared<RsrpRsrqSinr>();
    average->setRsrp0(rsrp - 3);
    average->setRsrp1(rsrp);
    average->setRsrq0(-10);
    average->setSinr0(25);
    KCellularLteRsrpRsrqSinr message;
    message.setAvgValues(std::move(average));
    for (int i = 0; i < 2; ++i) message.addInstValues(std::make_shared<RsrpRsrqSinr>());
    send(afterS, V::K_LTE_RSRP_RSRQ_SINR, message);
  }
  void neighbour(std::int64_t afterS, std::int32_t index) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(1300);
    cell->setNbrPhysCellId(34);
    cell->setNbrRsrp(index);
    KCellularLteNbrEutraCellMeas message;
    message.addMeasNbrEutra(std::move(cell));
    send(afterS, V::K_LTE_INTRARAT_MEAS, message);
  }
  void registration(std::int64_t afterS, std::int32_t cause) {
    KCellularEmmContext message;
    message.setRejectCause(cause);
    send(afterS, V::K_LTE_EMM_CTXT, message);
  }
  void say(const std::string& topic, const std::string& text) {
    _sent.push_back({"qelwatch/" + _name + "/" + topic, text + "\n"});
  }

 private:
  void send(std::int64_t afterS, std::int64_t metric, const PBCodable& message) {
    RecordedEvent event{
        static_cast<std::uint64_t>(_startS + afterS) * 1000, RecordedKind::metric, {}};
    event.entries.append(kRecordedMetricKey, metric);
    event.entries.append(kRecordedPayloadKey, message.data());
    std::string line = eventLine(event);
    line.pop_back();
    say(fleet::metricNameOf(event),
        line + ", \"stream\": 7, \"number\": " + std::to_string(++_number) + "}");
  }

  const std::string _name;
  const std::int64_t _startS;
  std::vector<PhoneMessages>& _sent;
  int _number = 0;
};

}  // namespace

std::vector<PhoneMessages> knownFleet(std::int64_t startS, std::int64_t nowS) {
  std::vector<PhoneMessages> sent;
  Phone a("a", startS, sent);
  a.cell(0, 217);
  a.state(1, kConnected);
  a.registration(2, 0);
  a.signal(60, -90);
  a.signal(120, -92);
  a.neighbour(121, 50);
  a.neighbour(122, 41);
  a.cell(180, 218);
  a.signal(240, -100);
  a.registration(300, 11);
  a.registration(301, 11);
  a.say("status", "online");
  a.say("queue", R"({"stream": 7, "dropped": 0, "lost": 0, "undecodable": 0})");
  Phone b("b", startS, sent);
  b.cell(0, 217);
  b.state(1, kIdle);
  b.signal(60, -110);
  b.cell(180, 218);
  b.registration(181, 0);
  b.registration(182, 11);
  b.say("queue", R"({"stream": 7, "dropped": 1, "lost": 0, "undecodable": 0})");
  b.say("queue", R"({"stream": 7, "dropped": 3, "lost": 1, "too_large": 4, "undecodable": 2})");
  Phone c("c", nowS, sent);
  c.cell(0, 300);
  return sent;
}

}  // namespace qel::testing
