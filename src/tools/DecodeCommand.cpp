// qelctl decode: payloads to dictionaries, one or many.

#include <CLI/CLI.hpp>
#include <cstdio>
#include <iostream>
#include <memory>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "messages/catalogue/MetricMessages.h"
#include "tools/Commands.h"
#include "tools/Decoding.h"
#include "tools/MetricArgument.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

struct DecodeOptions {
  std::string metric;
  std::optional<std::string> hex;
  bool batch = false;
  Printed printed = Printed::dictionary;
};

Bytes standardInput() {
  constexpr std::size_t kLargestPayload = 16 * 1024 * 1024;
  Bytes bytes;
  std::streambuf& input = *std::cin.rdbuf();
  for (int next = input.sbumpc(); next != EOF; next = input.sbumpc()) {
    if (bytes.size() == kLargestPayload) {
      throw ToolError(EX_DATAERR, "standard input", "longer than 16 MB");
    }
    bytes.push_back(static_cast<std::uint8_t>(next));
  }
  return bytes;
}

void decodeOne(const DecodeOptions& options, Output& output) {
  const std::uint32_t metric = parseMetric(options.metric);
  const MetricMessage* row = findMetricMessage(metric);
  if (!row) throw ToolError(EX_USAGE, options.metric, "no message class decodes this metric");
  const auto payload = options.hex ? bytesFromHex(*options.hex) : std::optional(standardInput());
  if (!payload) throw ToolError(EX_DATAERR, *options.hex, "not hexadecimal bytes");
  std::string text;
  if (!appendMessage(text, *row, *payload, options.printed)) {
    throw ToolError(EX_DATAERR, std::string(row->className), "the payload cannot be decoded");
  }
  output.line(text);
}

}  // namespace

void addDecodeCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("decode", "Decode payloads into JSON, one line each");
  const auto options = std::make_shared<DecodeOptions>();
  auto* metric = command->add_option("METRIC", options->metric,
                                     "Number (decimal, 0x-hex) or name of the metric");
  command->add_option("HEX", options->hex,
                      "Payload in hexadecimal; without it, raw bytes from standard input");
  command
      ->add_flag("--batch", options->batch,
                 "Read lines {\"metric\": N, \"payload\": \"HEX\"} from standard input")
      ->excludes(metric);
  command->add_flag_callback(
      "--reencode", [options] { options->printed = Printed::reencoded; },
      "Print the message encoded again, in hex");
  command->callback([options, &chosen] {
    if (!options->batch && options->metric.empty()) {
      throw CLI::RequiredError("METRIC or --batch");
    }
    chosen = [options](Output& output) {
      options->batch ? decodeBatch(options->printed, output) : decodeOne(*options, output);
    };
  });
}

}  // namespace qel::tools
