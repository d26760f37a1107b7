// A message of a phone, on its way into the tables of a fleet: raw, and as what publish makes of an
// event in both of its forms.

#include "fleet/DecodedLine.h"
#include "fleet/collect/PhoneMessage.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "recording/EventLine.h"

namespace qel::fuzz {
namespace {

using fleet::NumberedEvent;
using fleet::PhoneMessage;

constexpr std::string_view kTopic = "qelwatch/lab/x";

void expectRows(const PhoneMessage& message) {
  const auto* event = std::get_if<NumberedEvent>(&message);
  if (!event) return;
  law(event->number > 0 && event->number <= INT64_MAX, "a number has a place");
  law(event->rows.empty() || event->table, "rows are of a table");
  law(event->fault.empty() || event->rows.empty(), "a fault has no rows");
  law(event->rows.size() <= fleet::kMostRowsOfAnEvent, "so many rows and no more");
  for (const auto& row : event->rows) {
    law(row.size() == event->table->columns().size(), "a row has every column");
    for (const auto& cell : row) {
      law(!cell || cell->find('\0') == std::string::npos, "the database has a place for all text");
    }
  }
}

std::string numbered(std::string line) {
  line.pop_back();
  return line + ", \"stream\": 7, \"number\": 1}";
}

void tryForms(const RecordedEvent& event) {
  const PhoneMessage read = fleet::readPhoneMessage(kTopic, numbered(eventLine(event)));
  expectRows(read);
  const auto decoded = fleet::decodedLine(event);
  if (!decoded || !std::holds_alternative<NumberedEvent>(read)) return;
  const PhoneMessage other = fleet::readPhoneMessage(kTopic, numbered(*decoded));
  expectRows(other);
  const auto& one = std::get<NumberedEvent>(read);
  const auto* two = std::get_if<NumberedEvent>(&other);
  if (!two || !two->fault.empty() || !one.table) return;  // one form may be too long
  law(one.fault.empty() && one.table == two->table && one.rows == two->rows,
      "both forms say the same");
}

}  // namespace

void tryInput(Input input) {
  const Bytes bytes = input.rest();
  const std::string_view text = textOf(bytes);
  expectRows(fleet::readPhoneMessage(kTopic, text));
  fleet::readPhoneMessage("qelwatch/lab/queue", text);
  fleet::readPhoneMessage(text, "{}");
  const auto parsed = parseEventLine(text);
  if (const auto* event = std::get_if<RecordedEvent>(&parsed)) {
    if (!event->entries.contains("stream") && !event->entries.contains("number")) tryForms(*event);
  }
}

}  // namespace qel::fuzz
