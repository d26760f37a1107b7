// qelctl decode: payloads to dictionaries, one or many.

#include <CLI/CLI.hpp>
#include <iostream>
#include <iterator>
#include <memory>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "recording/JsonLine.h"
#include "tools/Commands.h"
#include "tools/MetricArgument.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

struct DecodeOptions {
  std::string metric;
  std::optional<std::string> hex;
  bool batch = false;
  bool reencode = false;
};

// The message as the command prints it, or nothing when the bytes are damaged.
std::optional<std::string> rendered(const MetricMessage& row, ByteView payload,
                                    const DecodeOptions& options, const char* quote) {
  if (options.reencode) {
    const auto message = row.decode(payload);
    return message ? std::optional(quote + hexText(message->data()) + quote) : std::nullopt;
  }
  const auto dictionary = row.describe(payload);
  return dictionary ? std::optional(jsonText(*dictionary)) : std::nullopt;
}

// Of a line of a batch, and of a payload on standard input.
constexpr std::size_t kLongestInputBytes = 16 * 1024 * 1024;

// Takes characters up to the end or the given one. False when there are too many.
template <class Buffer>
bool takeInput(Buffer& taken, std::optional<char> end) {
  using Traits = std::char_traits<char>;
  std::streambuf& input = *std::cin.rdbuf();
  for (int next = input.sbumpc(); next != Traits::eof(); next = input.sbumpc()) {
    const char c = Traits::to_char_type(next);
    if (c == end) return true;
    if (taken.size() == kLongestInputBytes) return false;
    taken.push_back(static_cast<typename Buffer::value_type>(c));
  }
  return true;
}

Bytes standardInput() {
  Bytes bytes;
  if (!takeInput(bytes, std::nullopt)) {
    throw ToolError(EX_DATAERR, "standard input", "longer than 16 MB");
  }
  return bytes;
}

void decodeOne(const DecodeOptions& options, Output& output) {
  const std::uint32_t metric = parseMetric(options.metric);
  const MetricMessage* row = findMetricMessage(metric);
  if (!row) throw ToolError(EX_USAGE, options.metric, "no message class decodes this metric");
  const auto payload = options.hex ? bytesFromHex(*options.hex) : std::optional(standardInput());
  if (!payload) throw ToolError(EX_DATAERR, *options.hex, "not hexadecimal bytes");
  const auto text = rendered(*row, *payload, options, "");
  if (!text) {
    throw ToolError(EX_DATAERR, std::string(row->className), "the payload cannot be decoded");
  }
  output.line(*text);
}

// One line of a batch: {"metric": N, "payload": "HEX"}.
struct Request {
  std::int64_t metric;
  Bytes payload;
};

// A number that is no 64-bit integer is that of no metric.
std::int64_t metricOf(const Value& value) {
  const bool isInteger =
      value.kind() == Value::Kind::signedInteger || value.kind() == Value::Kind::unsignedInteger;
  if (!isInteger) throw std::invalid_argument("\"metric\" is not an integer");
  return value.asInt64().value_or(-1);
}

Request parseRequest(const std::string& line) {
  const auto parsed = parseJsonLine(line);
  const auto* object = std::get_if<Dictionary>(&parsed);
  if (!object) {
    const LineFault& fault = std::get<LineFault>(parsed);
    throw std::invalid_argument(fault.isJson ? fault.reason : "not a JSON object");
  }
  const Value* metric = object->find("metric");
  if (!metric) throw std::invalid_argument("\"metric\" is not an integer");
  const Value* payload = object->find("payload");
  const auto hex = payload ? payload->asText() : std::nullopt;
  if (!hex) throw std::invalid_argument("\"payload\" is not a string");
  auto bytes = bytesFromHex(*hex);
  if (!bytes) throw std::invalid_argument("\"payload\" is not hexadecimal bytes");
  return {metricOf(*metric), std::move(*bytes)};
}

std::string answer(const Request& request, const DecodeOptions& options) {
  const auto identifier = catalogueIdentifier(request.metric);
  const MetricMessage* row = identifier ? findMetricMessage(*identifier) : nullptr;
  const auto text = row ? rendered(*row, request.payload, options, "\"") : std::nullopt;
  return text.value_or("null");
}

void decodeBatch(const DecodeOptions& options, Output& output) {
  std::ios::sync_with_stdio(false);
  std::string line;
  for (std::size_t number = 1; std::cin.peek() != EOF; ++number) {
    try {
      line.clear();
      if (!takeInput(line, '\n')) throw std::invalid_argument("longer than 16 MB");
      output.line(answer(parseRequest(line), options));
    } catch (const std::invalid_argument& error) {
      output.flush();
      throw ToolError(EX_DATAERR, "standard input, line " + std::to_string(number), error.what());
    }
    // A program that waits for each answer gets it before the next line is waited for.
    if (std::cin.rdbuf()->in_avail() <= 0) output.flush();
  }
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
  command->add_flag("--reencode", options->reencode, "Print the message encoded again, in hex");
  command->callback([options, &chosen] {
    if (!options->batch && options->metric.empty()) {
      throw CLI::RequiredError("METRIC or --batch");
    }
    chosen = [options](Output& output) {
      options->batch ? decodeBatch(*options, output) : decodeOne(*options, output);
    };
  });
}

}  // namespace qel::tools
