#include "tools/Decoding.h"

#include "base/Rendering.h"
#include "recording/PayloadLine.h"
#include "tools/InputLines.h"
#include "tools/MetricArgument.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

constexpr std::size_t kLongestLine = 16 * 1024 * 1024;  // bytes

[[noreturn]] void refuse(std::size_t number, const std::string& reason, Output& output) {
  output.flush();
  throw ToolError(EX_DATAERR, "standard input, line " + std::to_string(number), reason);
}

void answer(std::string& text, const PayloadLine& line, Printed printed) {
  const auto identifier = catalogueIdentifier(line.metric);
  const MetricMessage* row = identifier ? findMetricMessage(*identifier) : nullptr;
  const bool isQuoted = printed == Printed::reencoded;
  if (isQuoted) text += '"';
  if (!row || !appendMessage(text, *row, line.payload, printed)) {
    text = "null";
  } else if (isQuoted) {
    text += '"';
  }
}

}  // namespace

bool appendMessage(std::string& text, const MetricMessage& row, ByteView payload, Printed printed) {
  if (printed == Printed::reencoded) {
    const auto message = row.decode(payload);
    if (message) appendHex(text, message->data());
    return message != nullptr;
  }
  const auto dictionary = row.describe(payload);
  if (dictionary) appendJson(text, *dictionary);
  return dictionary.has_value();
}

void decodeBatch(Printed printed, Output& output) {
  InputLines input(kLongestLine);
  std::string_view line;
  std::string text;
  for (std::size_t number = 1;; ++number) {
    // A program that waits for each answer gets it before the next line is waited for.
    if (!input.isThere()) output.flush();
    const auto outcome = input.next(line);
    if (outcome == InputLines::Outcome::end) return;
    if (outcome == InputLines::Outcome::tooLong) refuse(number, "longer than 16 MB", output);
    const auto parsed = parsePayloadLine(line);
    if (const auto* reason = std::get_if<std::string>(&parsed)) refuse(number, *reason, output);
    text.clear();
    answer(text, std::get<PayloadLine>(parsed), printed);
    output.line(text);
  }
}

}  // namespace qel::tools
