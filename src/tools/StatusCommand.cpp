// qelctl status: what the service says about itself.

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "tesk/bus/ServiceStatus.h"
#include "tools/Commands.h"
#include "tools/Service.h"

namespace qel::tools {
namespace {

using tesk::bus::ServiceStatus;

struct StatusOptions {
  std::string bus = "system";
  bool json = false;
};

// What is known of it; none: null.
Value conditionValue(const tesk::bus::ConditionStatus& condition) {
  if (condition.state.empty()) return {};
  Dictionary known{{"state", condition.state}, {"text", condition.text}};
  if (!condition.reason.empty()) known.set("reason", condition.reason);
  if (!condition.model.empty()) known.set("model", condition.model);
  if (!condition.driver.empty()) known.set("driver", condition.driver);
  return known;
}

Dictionary factsValue(const std::vector<tesk::bus::FactStatus>& facts) {
  Dictionary known;
  for (const auto& fact : facts) known.set(fact.name, fact.value);
  return known;
}

void printJson(const ServiceStatus& status, Output& output) {
  List configurations;
  for (const auto& [application, metrics] : status.configurations) {
    configurations.emplace_back(Dictionary{{"application", application}, {"metrics", metrics}});
  }
  List clients;
  for (const auto& client : status.clients) {
    clients.emplace_back(Dictionary{{"name", client.name},
                                    {"events_on", client.eventsOn},
                                    {"delivered", client.delivered},
                                    {"dropped", client.dropped}});
  }
  const Dictionary told = {
      {"version", status.version},
      {"source", status.source},
      {"source_running", status.sourceRunning},
      {"condition", conditionValue(status.condition)},
      {"facts", factsValue(status.facts)},
      {"configurations", std::move(configurations)},
      {"clients", std::move(clients)},
      {"events", Dictionary{{"received", status.eventsReceived},
                            {"delivered", status.eventsDelivered},
                            {"dropped", status.eventsDropped},
                            {"undecodable", status.eventsUndecodable},
                            {"without_content", status.eventsWithoutContent}}}};
  output.line(forTerminal(jsonText(told)));
}

// Names come from other programs. As JSON strings they have an end that they cannot fake, and for a
// terminal they are nothing but text.
std::string quoted(const std::string& text) { return forTerminal(jsonText(Value(text))); }

void printCondition(const tesk::bus::ConditionStatus& condition, Output& output) {
  if (condition.state.empty()) return;
  std::string line = "condition       " + quoted(condition.text);
  if (!condition.model.empty()) line += ", model " + quoted(condition.model);
  if (!condition.driver.empty()) line += ", driver " + quoted(condition.driver);
  output.line(line);
}

void printText(const ServiceStatus& status, Output& output) {
  const auto number = [](std::uint64_t value) { return std::to_string(value); };
  output.line("service         version " + quoted(status.version));
  output.line("source          " + quoted(status.source) +
              (status.sourceRunning ? ", runs" : ", does not run: no client wants events"));
  printCondition(status.condition, output);
  for (const auto& fact : status.facts) {
    output.line("fact            " + quoted(fact.name) + ": " + quoted(fact.value));
  }
  for (const auto& [application, metrics] : status.configurations) {
    output.line("configuration   application " + std::to_string(application) + ", " +
                number(metrics) + " metrics");
  }
  for (const auto& client : status.clients) {
    output.line("client          " + quoted(client.name) + ", events " +
                (client.eventsOn ? "on" : "off") + ", " + number(client.delivered) +
                " delivered, " + number(client.dropped) + " dropped");
  }
  output.line("events          " + number(status.eventsReceived) + " received, " +
              number(status.eventsDelivered) + " delivered, " + number(status.eventsDropped) +
              " dropped, " + number(status.eventsUndecodable) + " undecodable, " +
              number(status.eventsWithoutContent) + " without content");
}

}  // namespace

void addStatusCommand(CLI::App& app, Action& chosen) {
  auto* command =
      app.add_subcommand("status", "Tell what the service does: its source, clients and events");
  const auto options = std::make_shared<StatusOptions>();
  addBusOption(*command, options->bus);
  command->add_flag("--json", options->json, "As one JSON object");
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      std::string why;
      const auto status = tesk::bus::readServiceStatus({options->bus}, why);
      if (!status) failWithoutService(why);
      options->json ? printJson(*status, output) : printText(*status, output);
    };
  });
}

}  // namespace qel::tools
