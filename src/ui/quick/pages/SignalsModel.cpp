#include "ui/quick/pages/SignalsModel.h"

#include <algorithm>
#include <utility>

#include "ui/quick/pages/Readings.h"
#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

QVariantMap contentOf(const NeighbourRow& row) {
  return {{"name", shown(row.name)},
          {"channel", shown(row.channel)},
          {"level", shown(row.level)},
          {"quality", shown(row.quality)},
          {"difference", shown(row.difference)},
          {"age", shown(row.age)},
          {"hasCurve", row.hasCurve},
          {"spoken", shown(row.spoken)}};
}

QVariantMap contentOf(const ReadOffValue& value, const Chart& chart) {
  const float range = std::max(1e-3F, chart.highest - chart.lowest);
  return {{"label", shown(value.label)},
          {"text", shown(value.text)},
          {"serving", value.isServing},
          {"height", std::clamp((value.value - chart.lowest) / range, 0.0F, 1.0F)}};
}

}  // namespace

void SignalsModel::take(SignalsPage page) {
  const int before = chartCount();
  _page = std::move(page);
  _charts.clear();
  for (const Chart& chart : _page.charts) {
    _charts << QVariantMap{{"title", shown(chart.title)},
                           {"unit", shown(chart.unit)},
                           {"newest", qel::contentOf(chart.newest)},
                           {"spoken", shown(chart.spoken)}};
  }
  takeNeighbours();
  if (before != chartCount()) emit chartCountChanged();
  emit changed();
  if (!_readOff.isEmpty()) readTime(_readOff.value("chart").toInt(), _readMs);
}

void SignalsModel::takeNeighbours() {
  std::vector<RowsModel::Row> rows;
  rows.reserve(_page.neighbours.size());
  for (const NeighbourRow& row : _page.neighbours) {
    rows.push_back({shown(row.id), {}, contentOf(row)});
  }
  _neighbours.take(std::move(rows));
}

QString SignalsModel::notice() const { return shown(_page.notice); }
QString SignalsModel::span() const { return shown(_page.span); }
QString SignalsModel::neighboursNotice() const { return shown(_page.neighboursNotice); }

void SignalsModel::setColumns(int columns) {
  if (columns < 0 || columns == this->columns()) return;
  _range.columns = static_cast<unsigned>(columns);
  emit columnsChanged();
  if (_ask) _ask();
}

void SignalsModel::zoom(qreal factor, qreal around) { look(_range.zoomed(factor, around)); }

void SignalsModel::move(qreal widths) { look(_range.moved(widths)); }

void SignalsModel::toEnd() {
  SignalsRange range = _range;
  range.backMs = 0;
  look(range);
}

void SignalsModel::look(const SignalsRange& range) {
  if (range == _range) return;
  _range = range;
  if (_ask) _ask();
}

const Chart* SignalsModel::chartAt(int chart) const {
  return chart >= 0 && chart < chartCount() ? &_page.charts[static_cast<std::size_t>(chart)]
                                            : nullptr;
}

void SignalsModel::readAt(int chart, qreal place) {
  const auto span = static_cast<double>(_page.toMs - _page.fromMs);
  readTime(chart, _page.fromMs + static_cast<std::uint64_t>(std::clamp(place, 0.0, 1.0) * span));
}

void SignalsModel::readNext(int chart) {
  const Chart* read = chartAt(chart);
  if (!read) return;
  const auto next = pointAfter(*read, _readOff.isEmpty() ? _page.fromMs : _readMs);
  if (next) readTime(chart, *next);
}

void SignalsModel::readPrevious(int chart) {
  const Chart* read = chartAt(chart);
  if (!read) return;
  const auto previous = pointBefore(*read, _readOff.isEmpty() ? _page.toMs + 1 : _readMs);
  if (previous) readTime(chart, *previous);
}

void SignalsModel::readTime(int chart, std::uint64_t timeMs) {
  const Chart* read = chartAt(chart);
  if (!read || timeMs < _page.fromMs || timeMs > _page.toMs) return stopReading();
  const ReadOff off = qel::readOff(*read, timeMs);
  QVariantList values;
  for (const ReadOffValue& value : off.values) values << contentOf(value, *read);
  const auto span = static_cast<double>(std::max<std::uint64_t>(1, _page.toMs - _page.fromMs));
  _readMs = off.timeMs;
  _readOff = {
      {"chart", chart},
      {"place", (static_cast<double>(off.timeMs) - static_cast<double>(_page.fromMs)) / span},
      {"time", shown(off.time)},
      {"values", values},
      {"spoken", shown(off.spoken)}};
  emit readOffChanged();
}

void SignalsModel::stopReading() {
  if (_readOff.isEmpty()) return;
  _readOff.clear();
  emit readOffChanged();
}

}  // namespace qel
