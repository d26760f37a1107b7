// What ModemManager may say of a modem, through the readings to reports that every client takes.

#include <array>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "fuzz/support/Variants.h"
#include "service/EventSubject.h"
#include "sources/MetricKeeper.h"
#include "sources/modem_manager/CellReadings.h"
#include "sources/modem_manager/ModemReading.h"
#include "sources/modem_manager/ModemReports.h"
#include "sources/modem_manager/Names.h"

namespace qel::fuzz {
namespace {

using namespace sources;

// Objects are called as fuzz/support/Variants.cpp calls them.
constexpr const char* kModemPath = "/0";

constexpr auto kWords = std::to_array<std::string_view>({"State",
                                                         "AccessTechnologies",
                                                         "Sim",
                                                         "Bearers",
                                                         "RegistrationState",
                                                         "PacketServiceState",
                                                         "OperatorCode",
                                                         "OperatorName",
                                                         "NetworkRejection",
                                                         "InitialEpsBearer",
                                                         "InitialEpsBearerSettings",
                                                         "Lte",
                                                         "Umts",
                                                         "Gsm",
                                                         "Location",
                                                         "Connected",
                                                         "Properties",
                                                         "ProfileId",
                                                         "Ip4Config",
                                                         "Ip6Config",
                                                         "Imsi",
                                                         "SimIdentifier",
                                                         "OperatorIdentifier",
                                                         "EmergencyNumbers",
                                                         "SimSlots",
                                                         "PrimarySimSlot",
                                                         "rssi",
                                                         "rsrp",
                                                         "rsrq",
                                                         "snr",
                                                         "rscp",
                                                         "ecio",
                                                         "apn",
                                                         "profile-id",
                                                         "ip-type",
                                                         "address",
                                                         "method",
                                                         "dns1",
                                                         "dns2",
                                                         "dns3",
                                                         "cell-type",
                                                         "serving",
                                                         "serving-cell-type",
                                                         "operator-id",
                                                         "tac",
                                                         "lac",
                                                         "ci",
                                                         "earfcn",
                                                         "uarfcn",
                                                         "arfcn",
                                                         "frequency-fdd-ul",
                                                         "bandwidth",
                                                         "physical-ci",
                                                         "psc",
                                                         "base-station-id",
                                                         "rx-level",
                                                         "error",
                                                         "access-technology",
                                                         "00101",
                                                         "001010",
                                                         "1A2B",
                                                         "0x1F",
                                                         "10.1.2.3",
                                                         "0.0.0.0",
                                                         "2001:db8::1",
                                                         "001010123456789",
                                                         "8900100000000000001F",
                                                         "internet",
                                                         "001,01,1A2B,1234567,2B1A",
                                                         "/1"});

constexpr std::array kInterfaces = {mm::kModem,    mm::kModem3gpp, mm::kSignal,
                                    mm::kLocation, mm::kBearer,    mm::kSim};

BusObjects nextObjects(Input& input) {
  BusObjects objects;
  for (std::size_t left = input.below(8); left > 0; --left) {
    const std::string path = "/" + std::to_string(input.below(8));
    const char* interface = kInterfaces[input.below(kInterfaces.size())];
    objects[path][interface] = nextVariants(input, kWords);
  }
  return objects;
}

ModemAnswers nextAnswers(Input& input) {
  ModemAnswers answers;
  answers.place = nextWord(input, kWords);
  const std::size_t cells = input.byte();
  if (cells == 0) return answers;
  answers.cells.emplace();
  for (std::size_t left = cells - 1; left > 0 && !input.empty(); --left) {
    if (const auto cell = cellReading(nextVariants(input, kWords))) answers.cells->push_back(*cell);
  }
  return answers;
}

void expectTaken(const SourceEvent& event) {
  service::EventFault fault;
  law(service::examineEvent(event, fault).has_value(), "every report of a modem can be delivered");
}

}  // namespace

void tryInput(Input input) {
  constexpr std::chrono::hours kPeriod{1};
  const std::uint64_t timeMs = input.number<std::uint64_t>();
  const BusObjects objects = nextObjects(input);
  const ModemAnswers answers = nextAnswers(input);
  const ModemPicture picture = pictureOf(objects, kModemPath, answers);
  MetricKeeper keeper(keptModemReports(), kPeriod);
  const auto build = modemReportBuilder(picture);
  const MetricKeeper::Clock::time_point now{kPeriod};
  int sent = 0;
  keeper.update(build, timeMs, now, [&](const SourceEvent& event) {
    ++sent;
    expectTaken(event);
  });
  keeper.update(build, timeMs + 1, now,
                [](const SourceEvent&) { law(false, "a value that did not change is sent once"); });
  int answered = 0;
  for (const ModemReportRow& row : modemReports()) {
    if (keeper.query(row.metric).known) ++answered;
  }
  law(answered == sent, "what was sent can be asked for");
  tellsServingCell(answers);
  const auto modem = objects.find(kModemPath);
  if (modem != objects.end()) partsOf(modem->second);
}

}  // namespace qel::fuzz
