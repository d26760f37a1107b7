#include "ui/pages/NowPage.h"

#include <algorithm>
#include <string_view>

#include "radio/Bands.h"
#include "radio/CellIdentity.h"
#include "radio/Frequencies.h"
#include "ui/pages/Charts.h"
#include "ui/pages/Connection.h"
#include "ui/pages/Freshness.h"
#include "ui/pages/ReadingOf.h"
#include "ui/pages/Words.h"

namespace qel {
namespace {

constexpr unsigned kSparkColumns = 60;  // of the sparkline: one each two seconds

std::string sentence(std::string_view text) {
  std::string result = capitalized(text);
  if (!result.empty() && result.back() != '.') result += '.';
  return result;
}

// What the newest registration or refusal said, when that was the last word on it.
std::string lastWord(const Viewpoint& viewpoint) {
  const auto& all = viewpoint.history->happenings();
  for (std::size_t i = viewpoint.history->happeningsUntil(viewpoint.nowMs); i > 0; --i) {
    const Happening& happening = all[i - 1];
    if (happening.kind == HappeningKind::reject || happening.kind == HappeningKind::registration) {
      return happening.text;
    }
  }
  return {};
}

// Whether the source's condition says that nothing is wrong, and so does not tell why.
bool isGood(const std::string& state) {
  constexpr std::array<std::string_view, 6> kGood = {"",      "running",    "playing",
                                                     "ended", "registered", "connected"};
  return std::ranges::find(kGood, state) != kGood.end();
}

void tellWhy(const Viewpoint& viewpoint, const Feed& feed, NowPage& page) {
  const Freshness fresh = freshness(feed, viewpoint);
  if (viewpoint.isLive && feed.reach != Feed::Reach::there) {
    page.reason = sentence(fresh.state);
    page.advice = fresh.advice;
  } else if (viewpoint.isLive && feed.isWithoutModem && !feed.condition.empty()) {
    page.reason = sentence(feed.condition);
  } else if (const std::string word = lastWord(viewpoint); !word.empty()) {
    page.reason = sentence(word);
  } else if (!viewpoint.isLive) {
    page.reason = "No cell was reported up to this moment.";
  } else if (!feed.condition.empty() && !isGood(feed.state)) {
    page.reason = sentence(feed.condition);
  } else {
    page.reason = "Searching: no cell has been reported yet.";
  }
  page.spoken = page.reason + (page.advice.empty() ? "" : " " + page.advice);
}

std::optional<std::uint32_t> countryOf(const Cell& cell) {
  if (cell.mcc.empty() || cell.mcc.size() > 3) return std::nullopt;
  std::uint32_t number = 0;
  for (const char digit : cell.mcc) {
    if (digit < '0' || digit > '9') return std::nullopt;
    number = number * 10 + static_cast<std::uint32_t>(digit - '0');
  }
  return number;
}

std::string bandOf(const MetricStore& store, const Cell& cell) {
  if (!cell.channel) return {};
  constexpr std::string_view kBand = "band ";
  if (std::string band = reportedBand(store, cell.technology, *cell.channel); !band.empty()) {
    return band;
  }
  const std::string band = bandText(cell.technology, *cell.channel, countryOf(cell));
  return band.starts_with(kBand) ? band.substr(kBand.size()) : band;
}

NowLine line(const char* id, std::string text, const char* unknown) {
  const bool isKnown = !text.empty();
  std::string shown = isKnown ? std::move(text) : unknown;
  std::string spoken = shown;
  return {id, std::move(shown), std::move(spoken), isKnown};
}

// A band of GSM may name the technology itself: "GSM 900".
std::string withBand(Technology technology, const std::string& band, std::string_view between) {
  std::string name(nameOf(technology));
  if (band.empty()) return name;
  return band.starts_with(name) ? band : (name += between) += band;
}

NowLine radioLine(const NowPage& page) {
  const bool isNumber = *page.technology != Technology::gsm;
  std::string text = withBand(*page.technology, page.band, isNumber ? " band " : ", ");
  const auto& channel = page.cell ? page.cell->channel : std::nullopt;
  if (channel) {
    const auto down = frequenciesOf(*page.technology, *channel, countryOf(*page.cell)).down;
    if (down) text += ", " + down->text();
  }
  return line("radio", std::move(text), "");
}

NowLine operatorLine(const std::optional<Cell>& cell) {
  const bool isKnown = cell && !cell->mcc.empty() && !cell->mnc.empty();
  return line("operator", isKnown ? "Operator " + cell->mcc + "-" + cell->mnc : "",
              "Operator not reported");
}

NowLine codeLine(Technology technology, const std::optional<Cell>& cell) {
  std::string text;
  if (cell && cell->code) {
    text = std::string(codeLabel(technology)) + " " + std::to_string(*cell->code);
  }
  if (cell && cell->channel) {
    if (!text.empty()) text += ", ";
    text += std::string(channelLabel(technology)) + " " + std::to_string(*cell->channel);
  }
  return line("code", std::move(text), "Cell code and channel not reported");
}

NowLine cellLine(Technology technology, const std::optional<Cell>& cell) {
  std::string text;
  if (cell && cell->area) {
    text = std::string(areaLabel(technology)) + " " + std::to_string(*cell->area);
  }
  if (!cell || !cell->cellId) return line("cell", std::move(text), "Cell identity not reported");
  if (!text.empty()) text += ", ";
  const std::string identity = cellIdText(technology, *cell->cellId);
  NowLine made = line("cell", text + "cell " + identity, "");
  made.text = capitalized(made.text);
  const auto dot = identity.find("·");
  if (dot == std::string::npos) return made;
  const bool isLte = technology == Technology::lte;
  made.spoken = text + (isLte ? "eNodeB " : "RNC ") + identity.substr(0, dot) +
                (isLte ? ", sector " : ", cell ") + identity.substr(dot + 2);
  return made;
}

NowLine connectionLine(const NowPage& page) {
  std::string text = capitalized(page.rrc);
  if (page.carriers) {
    if (!text.empty()) text += ", ";
    text += std::to_string(*page.carriers) + (*page.carriers == 1 ? " carrier" : " carriers");
  }
  return line("connection", std::move(text), "Connection not reported");
}

void setSparkline(const Viewpoint& viewpoint, Quantity quantity, NowPage& page) {
  page.runsToMs = viewpoint.nowMs;
  page.runsFromMs = viewpoint.nowMs - std::min(viewpoint.nowMs, kGlanceMs);
  page.runs = viewpoint.history->series(quantity).between(page.runsFromMs, page.runsToMs);
  for (Run& run : page.runs) run = thinned(run, page.runsFromMs, page.runsToMs, kSparkColumns);
  const Axis axis = widened(usualAxis(quantity), page.runs);
  page.lowest = axis.lowest;
  page.highest = axis.highest;
}

Reading take(const Viewpoint& viewpoint, Quantity quantity, std::optional<float>& value,
             NowPage& page) {
  MadeReading made = readingOf(viewpoint, quantity);
  if (made.point) value = made.point->value;
  page.changesAtMs = earlier(page.changesAtMs, made.changesAtMs);
  return std::move(made.reading);
}

void setReadings(const Viewpoint& viewpoint, NowPage& page) {
  const Technology technology = *page.technology;
  const Quantity level = levelOf(technology);
  page.level = take(viewpoint, level, page.levelDbm, page);
  if (const auto last = viewpoint.history->series(level).last(viewpoint.nowMs)) {
    page.ageMs = viewpoint.nowMs - std::min(viewpoint.nowMs, last->timeMs);
  }
  if (technology == Technology::lte) {
    page.quality = take(viewpoint, Quantity::lteRsrq, page.qualityDb, page);
    page.sinr = take(viewpoint, Quantity::lteSinr, page.sinrDb, page);
  } else if (technology == Technology::umts) {
    page.quality = take(viewpoint, Quantity::umtsEcno, page.qualityDb, page);
  }
  setSparkline(viewpoint, level, page);
}

void setSpoken(NowPage& page) {
  for (const NowLine& each : page.lines) page.spoken += each.spoken + ". ";
  page.spoken += page.level.spoken + ".";
  for (const auto& reading : {page.quality, page.sinr}) {
    if (reading && !reading->figure.empty()) page.spoken += " " + reading->spoken + ".";
  }
}

}  // namespace

NowPage nowPage(const Viewpoint& viewpoint, const Feed& feed) {
  NowPage page;
  page.cell = viewpoint.history->servingCell(viewpoint.nowMs);
  page.technology = viewpoint.history->technology(viewpoint.nowMs);
  if (!page.technology && page.cell) page.technology = page.cell->technology;
  if (!page.technology) {
    tellWhy(viewpoint, feed, page);
    return page;
  }
  if (page.cell && page.cell->technology != *page.technology) page.cell.reset();
  if (page.cell) page.band = bandOf(*viewpoint.store, *page.cell);
  page.badge = withBand(*page.technology, page.band, " ");
  page.rrc = connectionWord(*viewpoint.store, *page.technology);
  page.carriers = carrierCount(*viewpoint.store, *page.technology);
  page.lines = {radioLine(page), operatorLine(page.cell), codeLine(*page.technology, page.cell),
                cellLine(*page.technology, page.cell), connectionLine(page)};
  setReadings(viewpoint, page);
  setSpoken(page);
  return page;
}

}  // namespace qel
