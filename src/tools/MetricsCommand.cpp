// qelctl metrics: the catalogue.

#include <CLI/CLI.hpp>
#include <array>
#include <cstdio>
#include <memory>
#include <string>

#include "base/Rendering.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/DispatchTable.h"
#include "tools/Commands.h"

namespace qel::tools {
namespace {

std::string hexText(std::uint32_t identifier) {
  std::array<char, 16> text;
  std::snprintf(text.data(), text.size(), "0x%04X", identifier);
  return text.data();
}

std::string_view className(std::uint32_t identifier) {
  const MetricMessage* message = findMetricMessage(identifier);
  return message ? message->className : std::string_view();
}

bool hasHandler(std::uint32_t identifier) {
  return findDispatchRow(std::int64_t{identifier} + kMetricEventBase) != nullptr;
}

void printJson(Output& output) {
  List metrics;
  for (const auto& [identifier, name] : KBBMetricUtility::catalogue()) {
    const std::string_view message = className(identifier);
    metrics.emplace_back(Dictionary{{"identifier", identifier},
                                    {"hex", hexText(identifier)},
                                    {"name", name},
                                    {"class", message.empty() ? Value() : Value(message)},
                                    {"handler", hasHandler(identifier)}});
  }
  output.line(jsonText(Value(std::move(metrics))));
}

void printTable(Output& output) {
  const auto row = [&output](const char* identifier, const char* hex, std::string_view name,
                             std::string_view message, const char* handler) {
    std::array<char, 160> line;
    std::snprintf(line.data(), line.size(), "%10s  %-6s  %-7s  %-36.*s  %.*s", identifier, hex,
                  handler, static_cast<int>(name.size()), name.data(),
                  static_cast<int>(message.size()), message.data());
    output.line(line.data());
  };
  row("identifier", "hex", "name", "message class", "handler");
  for (const auto& [identifier, name] : KBBMetricUtility::catalogue()) {
    const std::string_view message = className(identifier);
    row(std::to_string(identifier).c_str(), hexText(identifier).c_str(), name,
        message.empty() ? "-" : message, hasHandler(identifier) ? "yes" : "no");
  }
}

}  // namespace

void addMetricsCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("metrics", "List the metrics of the catalogue");
  const auto json = std::make_shared<bool>(false);
  command->add_flag("--json", *json, "As one JSON array");
  command->callback([json, &chosen] {
    chosen = [json](Output& output) { *json ? printJson(output) : printTable(output); };
  });
}

}  // namespace qel::tools
