// One line of a recording, or of payloads: the short way to read it against the general one.

#include "base/Rendering.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "recording/EventLine.h"
#include "recording/PayloadLine.h"

namespace qel::fuzz {
namespace {

bool isSame(const RecordedEvent& a, const RecordedEvent& b) {
  return a.timeMs == b.timeMs && a.kind == b.kind && a.entries == b.entries &&
         jsonText(a.entries) == jsonText(b.entries);
}

void expectOneLine(const std::string& text) {
  for (const char c : text) {
    law(static_cast<unsigned char>(c) >= ' ' && c != '\x7F', "a reason is one line");
  }
}

void tryPayloads(std::string_view line) {
  const auto read = parsePayloadLine(line);
  const auto generally = parsePayloadLine("\n" + std::string(line));
  law(read.index() == generally.index(), "both ways take the same lines of payloads");
  if (const auto* payload = std::get_if<PayloadLine>(&read)) {
    const auto& same = std::get<PayloadLine>(generally);
    law(payload->metric == same.metric && payload->payload == same.payload,
        "both ways read the same payload");
  } else {
    expectOneLine(std::get<std::string>(read));
  }
}

}  // namespace

void tryInput(Input input) {
  const Bytes bytes = input.rest();
  const std::string_view line = textOf(bytes);
  if (line.find('\n') != std::string_view::npos) return;
  if (line.find_first_not_of(" \t\r") == std::string_view::npos) return;  // has a fault of its own
  tryPayloads(line);
  const auto read = parseEventLine(line);
  // A newline is a blank to the general parser, and to the short way the end of its patience.
  const auto generally = parseEventLine("\n" + std::string(line));
  law(read.index() == generally.index(), "both ways take the same lines");
  if (const auto* fault = std::get_if<LineFault>(&read)) {
    expectOneLine(fault->reason);
    law(fault->isJson == std::get<LineFault>(generally).isJson, "both ways refuse alike");
    return;
  }
  const auto& event = std::get<RecordedEvent>(read);
  law(isSame(event, std::get<RecordedEvent>(generally)), "both ways read the same event");
  law(hasReadableForm(event), "what was read has a readable form");
  law(event.timeMs <= kLastRecordedMs, "every time has a date");
  const std::string written = eventLine(event);
  law(written.find('\n') == std::string::npos, "an event is one line");
  const auto again = parseEventLine(written);
  law(std::holds_alternative<RecordedEvent>(again), "what was written can be read");
  law(isSame(event, std::get<RecordedEvent>(again)), "what was written says the same");
}

}  // namespace qel::fuzz
