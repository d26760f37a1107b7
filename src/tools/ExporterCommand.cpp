// qelctl exporter: the newest numbers for Prometheus.

#include <CLI/CLI.hpp>
#include <atomic>
#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include "base/Clock.h"
#include "base/DispatchQueue.h"
#include "base/TerminalText.h"
#include "base/TimeAsleep.h"
#include "capture/RecordConnection.h"
#include "capture/Recorder.h"
#include "fleet/Families.h"
#include "fleet/LatestNumbers.h"
#include "fleet/MetricsServer.h"
#include "fleet/ServiceCounts.h"
#include "tesk/bus/BusConnector.h"
#include "tools/Commands.h"
#include "tools/MainLoop.h"
#include "tools/Service.h"
#include "tools/TimeOption.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

constexpr std::uint64_t kLongestStaleMs = 7ULL * 24 * 60 * 60 * 1000;
constexpr int kMostWaitingEvents = 4096;

struct ExporterOptions {
  std::string bus = "system";
  std::string listen = "127.0.0.1:9817";
  fleet::ListenAddress address;
  std::uint64_t staleMs = 60'000;
};

// Since the machine was started: ages stay right over a sleep, and when somebody sets its clock.
std::uint64_t sinceStartMs() {
  using namespace std::chrono;
  return static_cast<std::uint64_t>(
      duration_cast<milliseconds>(sleeplessNow().time_since_epoch()).count());
}

struct Exported {
  explicit Exported(std::chrono::milliseconds stale) : board(stale), numbers(board) {}
  fleet::NumberBoard board;
  fleet::LatestNumbers numbers;        // main thread
  std::atomic<int> waitingEvents = 0;  // for the main thread
};

tesk::EventSink sinkInto(const std::shared_ptr<Exported>& exported) {
  return [exported](std::string_view eventName, const tesk::Message& event) {
    auto recorded = capture::recordedEvent(eventName, event, sinceStartMs());
    if (!recorded) return;
    if (exported->waitingEvents >= kMostWaitingEvents) {
      exported->board.countDropped();
      return;
    }
    ++exported->waitingEvents;
    MainQueue::shared().async([exported, taken = std::move(*recorded)] {
      --exported->waitingEvents;
      exported->numbers.take(taken);
    });
  };
}

void run(const ExporterOptions& options) {
  const auto say = [](const std::string& line) { complain("qelctl", line); };
  MainLoop loop;
  findResources();
  const Bytes asked = configuration();
  requireService(options.bus);
  const auto exported = std::make_shared<Exported>(std::chrono::milliseconds(options.staleMs));
  const auto counts = std::make_shared<fleet::ServiceCounts>(options.bus);
  std::string error;
  const auto server = fleet::MetricsServer::open(
      options.address,
      [exported, counts] {
        auto families = exported->board.families(sinceStartMs());
        counts->addTo(families);
        return families;
      },
      error);
  if (!server) throw ToolError(EX_UNAVAILABLE, error);
  std::unique_ptr<capture::RecordConnection> connection;
  const auto connector = tesk::bus::makeBusConnector(
      {options.bus}, serviceObserver(say, [&connection] { connection->begin(); }),
      loop.answerWaits());
  connection = std::make_unique<capture::RecordConnection>(*connector, capture::kExporter,
                                                           options.bus, asked, sinkInto(exported));
  const auto begun = connection->begin();
  const bool isToEnd = !loop.runOnce(MainLoop::Clock::now());
  if (begun.code != 0 && !isToEnd) failWithoutService(begun.message);
  const std::string place = server->address().text();
  say("http://" + place + "/metrics has the numbers");
  if (!server->address().isLoopback) {
    say("whoever reaches " + place + " may ask, and learns where the phone is");
  }
  while (loop.runOnce({})) {
  }
  connection->end();
}

}  // namespace

void addExporterCommand(CLI::App& app, Action& chosen) {
  auto* command =
      app.add_subcommand("exporter", "Answer Prometheus with the newest numbers, as OpenMetrics");
  command->footer(
      "They name the cell that the phone is on, and no subscriber. It runs until SIGINT or "
      "SIGTERM,\n"
      "and goes on when the service comes back.");
  const auto options = std::make_shared<ExporterOptions>();
  addBusOption(*command, options->bus);
  command->add_option("--listen", options->listen, "Where to answer; whoever reaches it may ask")
      ->type_name("ADDRESS:PORT")
      ->capture_default_str();
  command
      ->add_option("--stale", options->staleMs,
                   "A number is told no more when its report is older; 60s unless given")
      ->type_name("TIME")
      ->transform(asMilliseconds())
      ->check(CLI::Range(std::uint64_t{1000}, kLongestStaleMs).description(""));
  command->callback([options, &chosen] {
    const auto address = fleet::listenAddress(options->listen);
    if (!address) throw CLI::ValidationError("--listen is ADDRESS:PORT, such as 127.0.0.1:9817");
    options->address = *address;
    chosen = [options](Output&) { run(*options); };
  });
}

}  // namespace qel::tools
