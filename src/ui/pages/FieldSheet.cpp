#include "ui/pages/FieldSheet.h"

#include <algorithm>
#include <array>
#include <charconv>

#include "base/Rendering.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "radio/Quality.h"
#include "ui/pages/FieldCurve.h"
#include "ui/pages/FieldForms.h"
#include "ui/pages/FieldOrigin.h"
#include "ui/pages/Grade.h"
#include "ui/pages/Words.h"
#include "ui/screens/CategoryTable.h"

namespace qel {
namespace {

constexpr std::uint64_t kCurveMs = 10 * 60 * 1000;
constexpr std::uint64_t kShortestAgeMs = 5 * 1000;  // ages are told in steps of it

// The row of a table and where its value comes from.
struct Row {
  const Category* category;
  const Dictionary* record;
  const Dictionary::Entry* entry;
  FieldOrigin origin;
  const FieldFacts* facts;
};

// The section's record as the table draws it; null: it draws none there.
const Dictionary* shownRecord(const MetricStore& store, const Category& category, int section) {
  if (category.record) return section == 0 ? category.record(store) : nullptr;
  const EntryList& list = *category.list(store);
  if (section < 0 || static_cast<std::size_t>(section) >= list.size()) return nullptr;
  return &list[static_cast<std::size_t>(section)];
}

const Category* categoryOf(std::string_view technology, std::string_view category) {
  return findCategory(std::string(technology) + ' ' + std::string(category), Routine::cells);
}

std::optional<Row> rowAt(const MetricStore& store, const Category& category, int section, int row) {
  const Dictionary* record = shownRecord(store, category, section);
  if (!record || row < 0 || static_cast<std::size_t>(row) >= record->size()) return std::nullopt;
  const auto origin = originOf(category);
  if (!origin) return std::nullopt;
  const Dictionary::Entry& entry = record->at(static_cast<std::size_t>(row));
  const FieldFacts* facts = origin->find(entry.key.view());
  if (!facts) return std::nullopt;
  return Row{&category, record, &entry, *origin, facts};
}

// A report as it came, and the part of it that the row shows.
struct Report {
  JournalEntry entry;
  Dictionary whole;
  const Dictionary* part = nullptr;    // of the section
  const Dictionary* around = nullptr;  // of the field: the part, or the whole where it is carried
};

bool readReport(const Viewpoint& viewpoint, const Row& row, int section, Report& report) {
  const auto entry = viewpoint.history->lastReport(row.origin.row->identifier, viewpoint.nowMs);
  if (!entry) return false;
  auto whole = entry->row->describe(entry->payload);
  if (!whole) return false;
  report = {.entry = *entry, .whole = std::move(*whole)};
  report.part = partOf(report.whole, row.origin, section);
  const bool carried = row.origin.isCarried(row.entry->key.view());
  report.around = carried ? &report.whole : report.part;
  return true;
}

void add(FieldSheet& sheet, std::string id, std::string label, std::string value) {
  if (!value.empty()) sheet.lines.push_back({std::move(id), std::move(label), std::move(value)});
}

// Two's complement of 32 bits below zero, as it would stand in memory.
std::string hexadecimal(std::int64_t number) {
  const auto bits = number < 0 && number >= INT32_MIN
                        ? static_cast<std::uint64_t>(static_cast<std::uint32_t>(number))
                        : static_cast<std::uint64_t>(number);
  std::array<char, 2 * sizeof bits> digits;
  const auto end = std::to_chars(digits.begin(), digits.end(), bits, 16).ptr;
  return "0x" + std::string(digits.begin(), end);
}

std::string hexadecimal(const List& list) {
  std::string text;
  for (const Value& each : list) {
    const auto number = each.asInt64();
    if (!number) return {};
    text += (text.empty() ? "" : ", ") + hexadecimal(*number);
  }
  return text;
}

std::string howItTravels(const FieldFacts& facts) {
  return facts.raw.empty() ? "" : " (" + std::string(facts.raw) + ")";
}

void addRaw(FieldSheet& sheet, const RawField& field) {
  const std::string raw = howItTravels(field.facts);
  if (const auto number = rawNumber(field)) {
    add(sheet, "raw", "Raw value", std::to_string(*number) + raw);
    add(sheet, "hexadecimal", "Hexadecimal", hexadecimal(*number));
  } else if (const Bytes* bytes = field.value.asBytes()) {
    add(sheet, "raw", "Raw value", std::to_string(bytes->size()) + " bytes" + raw);
    add(sheet, "hexadecimal", "Hexadecimal", hexText(*bytes));
  } else {
    add(sheet, "raw", "Raw value", cellText(field.value) + raw);
    if (const List* list = field.value.asList()) {
      add(sheet, "hexadecimal", "Hexadecimal", hexadecimal(*list));
    }
  }
  for (FieldPart& part : partsOf(field)) {
    add(sheet, "decoded", std::move(part.label), std::move(part.text));
  }
}

std::string clauseText(std::string_view clause) {
  return clause.empty() ? std::string() : "3GPP TS " + std::string(clause);
}

void addMeaning(FieldSheet& sheet, const FieldFacts& facts) {
  add(sheet, "meaning", "Meaning", std::string(facts.meaning));
  add(sheet, "range", "Range", std::string(facts.range));
  add(sheet, "clause", "Defined in", clauseText(facts.clause));
}

std::string ageText(std::uint64_t age, std::uint64_t receivedMs, const TimeZone& zone) {
  const std::string time = secondText(receivedMs, zone);
  return age < kShortestAgeMs ? "just now, at " + time : durationText(age) + ", since " + time;
}

void addSource(FieldSheet& sheet, const Row& row) {
  const auto metric = row.origin.row->identifier;
  std::string text(row.origin.payload->name);
  add(sheet, "source", "Reported by", text + ", metric " + std::to_string(metric));
}

void setWord(FieldSheet& sheet, const Row& row) {
  const auto value = row.entry->value.asDouble();
  if (!row.facts->quality || !value) return;
  sheet.word = nameOf(gradeOf(*row.facts->quality, static_cast<float>(*value)));
}

// Wide enough for every value; a scale's own where there is one.
void setAxis(FieldSheet& sheet, const FieldFacts& facts) {
  sheet.lowest = sheet.curve.front().front().value;
  sheet.highest = sheet.lowest;
  if (facts.quality) {
    sheet.lowest = facts.quality->lowest;
    sheet.highest = facts.quality->highest;
  }
  for (const Run& run : sheet.curve) {
    for (const Point& point : run) {
      sheet.lowest = std::min(sheet.lowest, point.value);
      sheet.highest = std::max(sheet.highest, point.value);
    }
  }
  if (sheet.lowest < sheet.highest) return;
  sheet.lowest -= 1;
  sheet.highest += 1;
}

void setCurve(FieldSheet& sheet, const Viewpoint& viewpoint, const Row& row, const Report& report,
              int section) {
  const bool carried = row.origin.isCarried(row.entry->key.view());
  if (!hasCurve(*row.facts) || carried || !report.part) return;
  sheet.curveFromMs = viewpoint.nowMs - std::min(viewpoint.nowMs, kCurveMs);
  sheet.curveToMs = viewpoint.nowMs;
  sheet.curve = fieldCurve(viewpoint.history->journal(), row.origin, row.entry->key.view(),
                           *report.part, section, sheet.curveFromMs, sheet.curveToMs);
  if (!sheet.curve.empty()) setAxis(sheet, *row.facts);
}

std::string placeOf(std::string_view technology, std::string_view name, const Category& category,
                    int section) {
  std::string place(technology);
  place.append(", ").append(name);
  if (category.sectionTitle.empty()) return place;
  return place.append(", ").append(category.sectionTitle).append(std::to_string(section));
}

std::string clipboardOf(const FieldSheet& sheet) {
  std::string text = sheet.label + " (" + sheet.key + ")\n" + sheet.place + "\nValue: ";
  text += sheet.value;
  if (!sheet.unit.empty()) text += ' ' + sheet.unit;
  if (!sheet.word.empty()) text += ", " + sheet.word;
  text += '\n';
  for (const SheetLine& line : sheet.lines) text += line.label + ": " + line.value + '\n';
  return text;
}

}  // namespace

std::optional<FieldSheet> fieldSheet(const Viewpoint& viewpoint, std::string_view technology,
                                     std::string_view category, int section, int row,
                                     const TimeZone& zone) {
  const Category* known = categoryOf(technology, category);
  if (!known) return std::nullopt;
  const auto at = rowAt(*viewpoint.store, *known, section, row);
  if (!at) return std::nullopt;
  Report report;
  const bool reported = readReport(viewpoint, *at, section, report);
  std::string value = cellText(at->entry->value);
  if (!reported && value.empty()) return std::nullopt;  // a place kept for a report

  FieldSheet sheet;
  sheet.label = at->facts->label;
  sheet.key = at->entry->key.view();
  sheet.place = placeOf(technology, category, *known, section);
  sheet.value = std::move(value);
  sheet.unit = at->facts->unit;
  setWord(sheet, *at);
  addMeaning(sheet, *at->facts);
  if (reported) {
    const Value* raw = report.around ? report.around->find(sheet.key) : nullptr;
    const MessageFacts& around =
        at->origin.isCarried(sheet.key) ? *at->origin.payload : *at->origin.entry;
    if (raw) addRaw(sheet, {*at->facts, *raw, around, *report.around});
    sheet.receivedMs = report.entry.receivedMs;
    sheet.lines.push_back({"age", "Age", ""});
    setCurve(sheet, viewpoint, *at, report, section);
  }
  addSource(sheet, *at);
  if (!tellAge(sheet, viewpoint, zone)) sheet.clipboard = clipboardOf(sheet);
  return sheet;
}

bool tellAge(FieldSheet& sheet, const Viewpoint& viewpoint, const TimeZone& zone) {
  const auto line = std::ranges::find(sheet.lines, "age", &SheetLine::id);
  if (!sheet.receivedMs || line == sheet.lines.end()) return false;
  const std::uint64_t received = *sheet.receivedMs;
  const std::uint64_t age = viewpoint.nowMs - std::min(viewpoint.nowMs, received);
  sheet.changesAtMs.reset();
  if (viewpoint.isLive) sheet.changesAtMs = received + nextDurationMs(age);
  std::string text = ageText(age, received, zone);
  if (line->value == text) return false;
  line->value = std::move(text);
  sheet.clipboard = clipboardOf(sheet);
  return true;
}

std::optional<int> rowOfField(const Viewpoint& viewpoint, std::string_view technology,
                              std::string_view category, int section, std::string_view field) {
  const Category* known = categoryOf(technology, category);
  const Dictionary* record = known ? shownRecord(*viewpoint.store, *known, section) : nullptr;
  if (!record) return std::nullopt;
  const auto found =
      std::ranges::find(*record, field, [](const auto& entry) { return entry.key.view(); });
  if (found == record->end()) return std::nullopt;
  return static_cast<int>(found - record->begin());
}

}  // namespace qel
