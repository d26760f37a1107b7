// soak [--hours H] [--screens N]: a day of events at high speed through service, bus and viewer.
// Memory and descriptors must stay flat, and no event may go without a reason.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <csignal>
#include <iostream>
#include <map>
#include <sstream>
#include <thread>

#include "harness/MemoryGroup.h"
#include "harness/Program.h"
#include "harness/TemporaryDirectory.h"
#include "harness/Trial.h"
#include "soak/Day.h"
#include "soak/PlainClient.h"
#include "soak/Samples.h"
#include "support/PrivateBus.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;
using tesk::bus::ClientStatus;
using tesk::bus::ServiceStatus;

struct Options {
  double hours = 24;
  int screens = 1000;
  double speed = 500;
};

constexpr double kLeadInSeconds = 10;
constexpr auto kServiceWithin = 20s;
constexpr auto kStandsStill = 10s;  // no event for so long: all have come
constexpr auto kEndsWithin = 10s;

// What one client was sent and has had.
struct Account {
  std::string client = {};
  std::uint64_t sent = 0;       // by the source, and the answer to what the client asked
  std::uint64_t delivered = 0;  // as the service counts
  std::uint64_t unread = 0;     // dropped by the service, as it counts
  std::uint64_t taken = 0;      // as the client counts
  std::uint64_t tooFast = 0;    // dropped by the client, as it counts
};

class Soak {
 public:
  explicit Soak(const Options& options) : _options(options) {
    _day =
        writeDay(_directory.path() + "/day.jsonl", options.hours, kLeadInSeconds * options.speed);
    _seconds = _day.seconds / options.speed;
  }

  bool run() {
    startPrograms();
    watchUntilAllHaveCome();
    const auto told = status();
    promise(told.has_value(), "the service tells its status at the end");
    const auto accounts = endAndCount(*told);
    print(*told, accounts);
    return judge(*told, accounts);
  }

 private:
  std::optional<ServiceStatus> status() const {
    std::string why;
    return tesk::bus::readServiceStatus({_bus.address()}, why);
  }

  std::unique_ptr<Program> start(const std::string& name, std::vector<std::string> words,
                                 Conditions conditions = {}) {
    conditions.environment = offScreen(_directory.path());
    words.insert(words.begin() + 1, {"--bus", _bus.address()});
    auto program = std::make_unique<Program>(_directory.path(), name, std::move(words), conditions);
    _samples.emplace_back(name, program->process().pid());
    return program;
  }

  void startPrograms() {
    Conditions limited;
    if (_group.isThere()) limited.memoryGroup = _group.members();
    std::ostringstream source;
    source << "recording:" << _directory.path() << "/day.jsonl,speed=" << _options.speed;
    _service = start("service", {QEL_BASEBANDD, "--source", source.str()}, limited);
    const auto deadline = Clock::now() + kServiceWithin;
    while (!status()) {
      promise(Clock::now() < deadline, "the service is there soon after its start");
      std::this_thread::sleep_for(10ms);
    }
    _viewer = start("viewer", {QEL_SOAK_VIEWER, std::to_string(_options.screens),
                               std::to_string(static_cast<int>(_seconds))});
    _recorder = startRecorder();
    _client = std::make_unique<PlainClient>(_bus.address());
    _samples.emplace_back("bus", _bus.pid());
  }

  std::unique_ptr<Program> startRecorder() {
    auto words = std::vector<std::string>{QEL_QELCTL, "record", "--bus", _bus.address(),
                                          _directory.path() + "/recorded.jsonl"};
    auto program = std::make_unique<Program>(_directory.path(), "recorder", std::move(words));
    _samples.emplace_back("recorder", program->process().pid());
    return program;
  }

  void watchUntilAllHaveCome() {
    std::uint64_t received = 0;
    auto changedAt = Clock::now();
    const auto deadline = changedAt + std::chrono::seconds(static_cast<int>(_seconds * 3)) + 60s;
    while (Clock::now() - changedAt < kStandsStill) {
      std::this_thread::sleep_for(500ms);
      const auto told = status();
      promise(told.has_value(), "the service tells its status all day");
      if (told->eventsReceived != received) changedAt = Clock::now();
      received = told->eventsReceived;
      if (received < _day.all()) {
        for (Samples& samples : _samples) samples.look();
      }
      promise(Clock::now() < deadline, "the day comes to its end");
    }
  }

  static std::uint64_t numberAfter(const std::string& text, const std::string& word) {
    const auto at = text.find(word);
    return at == std::string::npos ? 0 : std::stoull(text.substr(at + word.size()));
  }

  std::string saidAtTheEnd(Program& program) const {
    program.process().signal(SIGTERM);
    const auto ended = program.process().waitForEnd(kEndsWithin);
    promise(ended == 0, "the " + program.name() + " ends in order: " + program.errors());
    return textOf(program.process().launch().out) + program.errors();
  }

  std::vector<Account> endAndCount(const ServiceStatus& told) {
    const std::string viewer = saidAtTheEnd(*_viewer);
    _screensOpened = numberAfter(viewer, "screens ");
    const std::string recorder = saidAtTheEnd(*_recorder);
    constexpr std::uint64_t kSimFiles = 1;  // the programs ask for them at their start
    std::map<std::string, Account> accounts;
    accounts["qelwatch"] = {
        .sent = _day.wanted() + kSimFiles,
        .taken = numberAfter(viewer, "metrics ") + numberAfter(viewer, "triggers ")};
    accounts["qelctl-record"] = {.sent = _day.wanted() + kSimFiles,
                                 .taken = numberAfter(recorder, "recorded.jsonl: ")};
    accounts[PlainClient::kName] = {.sent = _day.wanted(), .taken = _client->events()};
    std::vector<Account> all;
    for (auto& [name, account] : accounts) {
      account.client = name;
      const auto client = std::ranges::find(told.clients, name, &ClientStatus::name);
      if (client != told.clients.end()) {
        account.delivered = client->delivered;
        account.unread = client->dropped;
      }
      all.push_back(account);
    }
    return all;
  }

  void print(const ServiceStatus& told, const std::vector<Account>& accounts) const {
    std::cout << "| process | memory, first quarter | last quarter | descriptors, first | last |\n"
                 "|---|---|---|---|---|\n";
    for (const Samples& samples : _samples) {
      std::cout << "| " << samples.name() << " | " << static_cast<int>(samples.firstKb())
                << " KiB | " << static_cast<int>(samples.lastKb()) << " KiB | "
                << samples.firstDescriptors() << " | " << samples.lastDescriptors() << " |\n";
    }
    std::cout
        << "\n| client | sent by the source | delivered by the service | of that dropped: not "
           "read | taken by the client | dropped by it: too fast | lost without a reason "
           "|\n|---|---|---|---|---|---|---|\n";
    for (const Account& account : accounts) {
      std::cout << "| " << account.client << " | " << account.sent << " | " << account.delivered
                << " | " << account.unread << " | " << account.taken << " | " << account.tooFast
                << " | " << lost(account) << " |\n";
    }
    std::cout << "\n"
              << told.eventsReceived << " of " << _day.all() << " events came from the source, "
              << _day.leadIn << " of which no configuration asks for; " << told.eventsUndecodable
              << " were held back as undecodable; " << _screensOpened
              << " screens were opened and left; " << _options.hours << " hours in "
              << static_cast<int>(_seconds) << " s.\n";
  }

  // On the way from the service to the client, or because it was never delivered.
  std::int64_t lost(const Account& account) const {
    const auto number = [](std::uint64_t value) { return static_cast<std::int64_t>(value); };
    return number(account.sent) - number(account.taken) - number(account.unread) -
           number(account.tooFast);
  }

  bool judge(const ServiceStatus& told, const std::vector<Account>& accounts) const {
    bool kept = true;
    const auto look = [&kept](bool holds, const std::string& what) {
      if (!holds) std::cout << "BROKEN: " << what << '\n';
      kept = kept && holds;
    };
    look(told.eventsReceived == _day.all(), "the service has every event of the source");
    look(_screensOpened == static_cast<std::uint64_t>(_options.screens), "every screen was opened");
    for (const Account& account : accounts) {
      look(lost(account) == 0, account.client + " has lost no event without a reason");
      look(account.delivered == account.taken + account.unread + account.tooFast,
           "service and " + account.client + " count the same");
    }
    for (const Samples& samples : _samples) {
      look(samples.isFlat(), "memory and descriptors of the " + samples.name() + " are flat");
    }
    return kept;
  }

  const Options _options;
  const TemporaryDirectory _directory;
  Day _day;
  double _seconds = 0;  // that the day takes
  testing::PrivateBus _bus;
  MemoryGroup _group;
  std::vector<Samples> _samples;
  std::unique_ptr<Program> _service;
  std::unique_ptr<Program> _viewer;
  std::unique_ptr<Program> _recorder;
  std::unique_ptr<PlainClient> _client;
  std::uint64_t _screensOpened = 0;
};

int runSoak(const Options& options) {
  try {
    return Soak(options).run() ? EXIT_SUCCESS : EXIT_FAILURE;
  } catch (const std::exception& broken) {
    std::cout << "BROKEN: " << broken.what() << '\n';
    return EXIT_FAILURE;
  }
}

}  // namespace
}  // namespace qel::trials

int main(int argc, char** argv) {
  qel::trials::Options options;
  CLI::App app("A day of events at high speed through service, bus and viewer", "soak");
  app.add_option("--hours", options.hours, "So long a day")
      ->check(CLI::Range(0.1, 10000.0))
      ->capture_default_str();
  app.add_option("--screens", options.screens, "So many screens are opened and left meanwhile")
      ->check(CLI::Range(1, 10000000))
      ->capture_default_str();
  app.add_option("--speed", options.speed, "So many times faster than a day")
      ->check(CLI::Range(1.0, 100000.0))
      ->capture_default_str();
  CLI11_PARSE(app, argc, argv);
  return qel::trials::runSoak(options);
}
