// qelctl publish: live events to a broker.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>

#include "base/DispatchQueue.h"
#include "base/TerminalText.h"
#include "capture/RecordConnection.h"
#include "fleet/EventIntake.h"
#include "fleet/PhoneName.h"
#include "fleet/Publisher.h"
#include "tesk/bus/BusConnector.h"
#include "tools/BrokerOptions.h"
#include "tools/Commands.h"
#include "tools/MainLoop.h"
#include "tools/Service.h"
#include "tools/SilentValidator.h"
#include "tools/StateFolder.h"
#include "tools/TimeOption.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using namespace std::chrono_literals;
using LoopClock = MainLoop::Clock;
using Seconds = std::chrono::duration<double>;

struct Options {
  BrokerOptions broker;
  std::string bus = "system";
  std::string phone;
  std::string stateFolder;
  fleet::PublishSettings settings;
  fleet::EventQueue::Limits limits;
  std::uint64_t everyMs = 10'000;
  std::uint64_t keepAliveMs = 900'000;
  std::uint64_t ageMs = 14ULL * 24 * 60 * 60 * 1000;
  std::optional<double> durationS;
  bool decoded = false;
  bool keepIdentities = false;
};

void say(const std::string& line) { complain("qelctl", line); }

fleet::PublishSettings settingsOf(const Options& options) {
  fleet::PublishSettings settings = options.settings;
  settings.link = linkSettingsOf(options.broker);
  settings.every = std::chrono::milliseconds(options.everyMs);
  settings.link.keepAlive =
      std::chrono::ceil<std::chrono::seconds>(std::chrono::milliseconds(options.keepAliveMs));
  return settings;
}

std::string phoneOf(const Options& options, const std::string& folder) {
  if (!options.phone.empty()) return options.phone;
  std::string error;
  const auto name = fleet::keptPhoneName(folder, error);
  if (!name) throw ToolError(EX_IOERR, error);
  return *name;
}

std::unique_ptr<fleet::EventQueue> queueIn(const std::string& folder, const Options& options) {
  fleet::EventQueue::Limits limits = options.limits;
  limits.age = std::chrono::milliseconds(options.ageMs);
  std::string error;
  auto queue = fleet::EventQueue::open(folder, limits, error);
  if (!queue) throw ToolError(EX_IOERR, error);
  return queue;
}

std::string summary(const fleet::Publisher& publisher, const fleet::EventQueue& queue,
                    const fleet::EventIntake& intake, const Options& options) {
  const auto counts = queue.counts();
  std::string text = options.broker.link.broker.text() + ": " + std::to_string(publisher.sent()) +
                     " events sent, " + std::to_string(counts.waiting) + " wait";
  const auto add = [&text](std::uint64_t count, const char* what) {
    if (count > 0) text += ", " + std::to_string(count) + what;
  };
  add(counts.dropped, " dropped so far, beyond the limits of the queue");
  add(counts.lost, " lost, which the disk did not take");
  add(counts.tooLarge, " larger than the broker takes");
  add(intake.counts().undecodable, " undecodable left out");
  add(intake.counts().stripped, " without their unknown content");
  return text + (options.keepIdentities ? ", identities kept" : ", identities hidden");
}

void runUntilTheEnd(const Options& options, MainLoop& loop, fleet::Publisher& publisher,
                    const fleet::EventIntake& intake) {
  std::optional<LoopClock::time_point> end;
  if (options.durationS) {
    end = LoopClock::now() +
          std::chrono::duration_cast<LoopClock::duration>(Seconds(*options.durationS));
  }
  while (loop.runOnce(end)) {
    if (end && LoopClock::now() >= *end) return;
    publisher.setLeftOut(intake.counts().undecodable);
    if (const auto refusal = publisher.refusal()) throw ToolError(EX_UNAVAILABLE, *refusal);
  }
}

void run(const Options& options) {
  MainLoop loop;
  findResources();
  const Bytes asked = configuration();
  fleet::PublishSettings settings = settingsOf(options);
  const std::string folder = stateFolder(options.stateFolder);
  const auto queue = queueIn(folder, options);
  settings.phone = phoneOf(options, folder);
  if (!settings.keepsTrying) requireService(options.bus);
  fleet::Publisher publisher(*queue, settings, [](const std::string& line) {
    MainQueue::shared().async([line] {
      if (!line.empty()) say(line);
    });
  });
  auto hider =
      options.keepIdentities ? nullptr : std::make_unique<IdentityHider>(Pseudonyms::random());
  fleet::EventIntake intake(
      *queue, options.decoded ? fleet::EventForm::decoded : fleet::EventForm::recorded,
      std::move(hider), [&publisher](std::size_t bytes) { publisher.queued(bytes); });
  std::unique_ptr<capture::RecordConnection> connection;
  const auto connector = tesk::bus::makeBusConnector(
      {options.bus}, serviceObserver(say, [&connection] { connection->begin(); }),
      loop.answerWaits());
  connection = std::make_unique<capture::RecordConnection>(
      *connector, capture::kPublisher, options.bus, asked,
      [&intake](std::string_view eventName, const tesk::Message& event) {
        intake.take(eventName, event);
      });
  const auto begun = connection->begin();
  const bool isToEnd = !loop.runOnce(LoopClock::now());
  if (begun.code != 0 && !settings.keepsTrying && !isToEnd) failWithoutService(begun.message);
  runUntilTheEnd(options, loop, publisher, intake);
  connection->end();
  connection.reset();
  const bool hasEnded = publisher.end(3s);
  say(summary(publisher, *queue, intake, options));
  // A thread that waits for the network cannot be told to stop; what is queued is on the disk.
  if (!hasEnded) std::_Exit(EX_OK);
}

void addLinkOptions(CLI::App& command, Options& options) {
  addBrokerOptions(command, options.broker, "This phone's certificate");
  command
      .add_option("--keep-alive", options.keepAliveMs,
                  "When a silent broker is asked for a sign, 0 for never; 15m unless given")
      ->type_name("TIME")
      ->transform(asMilliseconds())
      ->check(silent(CLI::Range(std::uint64_t{0}, std::uint64_t{65535000})));
  command.add_flag("--await-receiver", options.broker.link.awaitsReceiver,
                   "Keep events while nobody has subscribed to them, if the broker tells");
  command.add_flag("--keep-trying", options.settings.keepsTrying,
                   "Go on without service or when the broker refuses");
}

void addQueueOptions(CLI::App& command, Options& options) {
  constexpr std::uint64_t kYearMs = 365ULL * 24 * 60 * 60 * 1000;
  const auto time = asMilliseconds();
  command
      .add_option("--every", options.everyMs,
                  "How long an event waits for others, such as 500ms or 1m; 10s unless given")
      ->type_name("TIME")
      ->transform(time)
      ->check(silent(CLI::Range(std::uint64_t{0}, std::uint64_t{86'400'000})));
  command
      .add_option("--batch", options.settings.batchBytes,
                  "Send earlier when so much waits; 64K unless given")
      ->type_name("BYTES|K|M|G")
      ->transform(silent(CLI::AsSizeValue(false)));
  command
      .add_option("--queue-size", options.limits.bytes,
                  "Drop the oldest events beyond this size; 256M unless given")
      ->type_name("BYTES|K|M|G")
      ->transform(silent(CLI::AsSizeValue(false)))
      ->check(silent(CLI::PositiveNumber));
  command.add_option("--queue-age", options.ageMs, "Drop events beyond this age; 14d unless given")
      ->type_name("TIME")
      ->transform(time)
      ->check(silent(CLI::Range(std::uint64_t{1000}, kYearMs)));
  command.add_option("--state", options.stateFolder, "Folder of the queue and of the phone's name")
      ->type_name("DIR");
}

}  // namespace

void addPublishCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("publish", "Send live events to an MQTT broker");
  command->footer(
      "Events go to qelwatch/PHONE/METRIC, with identities hidden. Cells and areas stay: they "
      "tell\n"
      "where the phone is. What cannot be sent waits on the disk. It runs until SIGINT or "
      "SIGTERM.");
  const auto options = std::make_shared<Options>();
  addBusOption(*command, options->bus);
  command->add_option("--phone", options->phone, "Name of this phone; a random one unless given")
      ->type_name("NAME");
  command->add_flag("--decoded", options->decoded,
                    "Send records in the units of the tables instead of lines of a recording");
  command->add_flag("--keep-identities", options->keepIdentities, "Send them as they are");
  command->add_option("--duration", options->durationS, "End after this many seconds")
      ->type_name("SECONDS")
      ->check(silent(CLI::Range(0.001, 1e9)));
  addLinkOptions(*command, *options);
  addQueueOptions(*command, *options);
  command->callback([options, &chosen] {
    checkBrokerOptions(options->broker);
    const std::string why =
        options->phone.empty() ? std::string() : fleet::faultOfPhoneName(options->phone);
    if (!why.empty()) throw CLI::ValidationError(why);
    if (options->keepAliveMs != 0 && options->keepAliveMs < 5000) {
      throw CLI::ValidationError("--keep-alive is 0 or 5s at least");
    }
    chosen = [options](Output&) { run(*options); };
  });
}

}  // namespace qel::tools
