// qelctl collect: what phones send to a broker into a database.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <array>
#include <csignal>
#include <cstdint>
#include <exception>
#include <iostream>
#include <string>
#include <string_view>

#include "base/CoreDumps.h"
#include "base/TerminalText.h"
#include "fleet/collect/Collector.h"
#include "fleet/collect/DatabaseAddress.h"
#include "fleet/collect/Preparation.h"
#include "tools/BrokerOptions.h"
#include "tools/SilentValidator.h"
#include "tools/StopSignals.h"
#include "tools/TimeOption.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

constexpr std::size_t kLongestName = 64;

struct Options {
  BrokerOptions broker;
  std::string database;
  fleet::CollectSettings settings;
  std::string name;
  std::string group = "qelwatch";
  std::uint64_t everyMs = 500;
  std::uint64_t patienceMs = 60'000;
  std::uint64_t sessionMs = 7ULL * 24 * 60 * 60 * 1000;
  bool prepares = false;
};

void say(const std::string& line) { complain("qelctl", line); }

std::string hostName() {
  std::array<char, 256> name{};
  ::gethostname(name.data(), name.size() - 1);
  return name.data();
}

// What is a part of a topic, or of a client's name.
bool isName(std::string_view name) {
  return !name.empty() && name.size() <= kLongestName &&
         name.find_first_not_of(
             "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789._-") ==
             std::string_view::npos;
}

int exitCodeOf(const fleet::DatabaseTrouble& trouble) {
  return trouble.kind == fleet::DatabaseTrouble::Kind::layout ? EX_CONFIG : EX_UNAVAILABLE;
}

void prepare(const Options& options, const std::string& database) {
  fleet::Prepared prepared;
  fleet::DatabaseTrouble trouble;
  const fleet::AnswerPatience patience{std::chrono::milliseconds(options.patienceMs)};
  if (!fleet::prepareDatabase(database, patience, prepared, trouble)) {
    throw ToolError(exitCodeOf(trouble), "database", trouble.why);
  }
  say("database: " + std::to_string(prepared.tables) + " tables made, " +
      std::to_string(prepared.columns) + " columns added, " +
      (prepared.hasHypertables ? "hypertables" : "partitions by day") +
      (prepared.couldHaveHypertables
           ? "; CREATE EXTENSION timescaledb before this would have made hypertables"
           : ""));
}

std::string summary(const Options& options, const fleet::CollectCounts& counts) {
  std::string text = options.broker.link.broker.text() + ": " +
                     std::to_string(counts.database.stored) + " events stored";
  const auto add = [&text](std::uint64_t count, const char* what) {
    if (count > 0) text += ", " + std::to_string(count) + what;
  };
  add(counts.database.faulty, " of them without values");
  add(counts.database.again, " came again");
  add(counts.database.refused, " not taken by the database");
  add(counts.broken, " messages of no phone");
  return text;
}

void collect(const Options& options, const std::string& database) {
  fleet::CollectSettings settings = options.settings;
  settings.link = linkSettingsOf(options.broker);
  settings.database = database;
  settings.name = options.name;
  settings.group = options.group;
  settings.every = std::chrono::milliseconds(options.everyMs);
  settings.patience = std::chrono::milliseconds(options.patienceMs);
  settings.sessionAge =
      std::chrono::ceil<std::chrono::seconds>(std::chrono::milliseconds(options.sessionMs));
  const StopSignals signals;
  fleet::Collector collector(settings, say);
  const auto end = collector.run([&] { return signals.arrived() != 0; }, signals.wakeUp());
  say(summary(options, collector.counts()));
  if (end) throw ToolError(end->isLayout ? EX_CONFIG : EX_UNAVAILABLE, end->why);
}

void addOptions(CLI::App& app, Options& options) {
  addBrokerOptions(app, options.broker, "This collector's certificate");
  app.get_option("URL")->required(false);
  app.add_option("--database", options.database,
                 "\"dbname=NAME host=HOST …\" or postgresql://HOST/NAME, without a password")
      ->required();
  app.add_flag("--prepare", options.prepares,
               "Make the tables and roles, or what is missing of them, and end");
  app.add_option("--name", options.name,
                 "Of this collector at the broker, no other's; the host's name unless given")
      ->type_name("NAME");
  app.add_option("--group", options.group, "Of the collectors that share the messages")
      ->type_name("NAME")
      ->capture_default_str();
  app.add_option("--every", options.everyMs,
                 "How long a message waits for others; 500ms unless given")
      ->type_name("TIME")
      ->transform(asMilliseconds())
      ->check(silent(CLI::Range(std::uint64_t{0}, std::uint64_t{30'000})));
  app.add_option("--batch", options.settings.batch, "Store earlier when so many have come")
      ->type_name("MESSAGES")
      ->check(silent(CLI::Range(std::size_t{1}, std::size_t{20'000})))
      ->capture_default_str();
  app.add_option("--patience", options.patienceMs,
                 "How long the database may take for a statement; 60s unless given")
      ->type_name("TIME")
      ->transform(asMilliseconds())
      ->check(silent(CLI::Range(std::uint64_t{1'000}, std::uint64_t{3'600'000})));
  app.add_option("--session", options.sessionMs,
                 "How long the broker keeps messages for it while it is away; 7d unless given")
      ->type_name("TIME")
      ->transform(asMilliseconds())
      ->check(silent(CLI::Range(std::uint64_t{0}, std::uint64_t{365ULL * 24 * 60 * 60 * 1000})));
  app.add_flag("--keep-trying", options.settings.keepsTrying,
               "Go on when broker or database refuses");
}

void check(Options& options, std::string& database) {
  std::string why;
  const auto address = fleet::databaseAddress(options.database, why);
  if (!address) throw CLI::ValidationError(why);
  database = *address;
  if (options.prepares) {
    if (!options.broker.url.empty()) throw CLI::ValidationError("--prepare needs no URL");
    return;
  }
  if (options.broker.url.empty()) throw CLI::ValidationError("URL is required");
  checkBrokerOptions(options.broker);
  if (options.name.empty()) options.name = hostName();
  for (const std::string& name : {options.name, options.group}) {
    if (isName(name)) continue;
    throw CLI::ValidationError("a name has 1 to 64 letters, digits, '.', '-' and '_'");
  }
}

int run(int argc, char** argv) {
  CLI::App app("Store what phones send to a broker in a PostgreSQL database", "qelctl collect");
  app.footer(
      "A message is acknowledged when its event is committed; what comes again changes nothing.\n"
      "As many may run as you like, each with a --name of its own. It runs until SIGINT or "
      "SIGTERM.");
  Options options;
  std::string database;
  addOptions(app, options);
  try {
    app.parse(argc, argv);
    check(options, database);
  } catch (const CLI::Success& success) {
    return app.exit(success);
  } catch (const CLI::ParseError& error) {
    const std::string text = error.what();
    say("usage: " + text.substr(0, text.find('\n')));
    return EX_USAGE;
  }
  leaveNoCore();
  std::signal(SIGPIPE, SIG_IGN);
  options.prepares ? prepare(options, database) : collect(options, database);
  return EX_OK;
}

}  // namespace
}  // namespace qel::tools

int main(int argc, char** argv) {
  try {
    return qel::tools::run(argc, argv);
  } catch (const qel::tools::ToolError& error) {
    qel::complain("qelctl", error.what());
    return error.code();
  } catch (const std::exception& error) {
    qel::complain("qelctl", error.what());
    return EX_SOFTWARE;
  }
}
