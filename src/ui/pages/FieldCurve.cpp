#include "ui/pages/FieldCurve.h"

#include <algorithm>
#include <optional>
#include <span>

#include "metrics/BandwidthTable.h"

namespace qel {
namespace {

constexpr std::size_t kMostReports = 16384;

// As the table would show it; nothing for what is no number.
std::optional<float> shownNumber(const FieldOrigin& origin, std::string_view field,
                                 const Value& raw) {
  static const BandwidthTable bandwidths = makeBandwidthTable();
  const auto& rewrites = origin.copy ? origin.copy->rewrites : origin.row->derivation.inPlace;
  Dictionary alone;
  alone.set(Text(field), raw);
  for (const Rewrite& rewrite : rewrites) {
    if (rewrite.key == field) applyRewrite(rewrite, alone, bandwidths);
  }
  const Value* shown = alone.find(field);
  const auto number = shown ? shown->asDouble() : std::nullopt;
  if (!number) return std::nullopt;
  return static_cast<float>(*number);
}

}  // namespace

bool hasCurve(const FieldFacts& facts) {
  constexpr std::array kMeasured = {
      FieldForm::plain,     FieldForm::duration,  FieldForm::rsrpIndex, FieldForm::rsrqIndex,
      FieldForm::rscpIndex, FieldForm::ecnoIndex, FieldForm::rxlevIndex};
  return std::ranges::count(kMeasured, facts.form) > 0 && facts.values.empty() &&
         facts.holds.empty() && !facts.repeated && !facts.identifies;
}

std::vector<Run> fieldCurve(const Journal& journal, const FieldOrigin& origin,
                            std::string_view field, const Dictionary& part, int section,
                            std::uint64_t fromMs, std::uint64_t toMs) {
  const auto reports = journal.of(origin.row->identifier, fromMs, toMs);
  const std::size_t looked = std::min(reports.size(), kMostReports);
  Series series;
  for (const JournalEntry& entry : std::span(reports).last(looked)) {
    const auto report = origin.row->describe(entry.payload);
    const Dictionary* same = report ? sameEntry(*report, origin, part, section) : nullptr;
    const Value* raw = same ? same->find(field) : nullptr;
    const auto value = raw ? shownNumber(origin, field, *raw) : std::nullopt;
    if (value) {
      series.add(entry.receivedMs, *value);
    } else {
      series.interrupt();
    }
  }
  return series.between(fromMs, toMs);
}

}  // namespace qel
