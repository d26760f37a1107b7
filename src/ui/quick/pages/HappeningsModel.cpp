#include "ui/quick/pages/HappeningsModel.h"

#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

QVariantMap contentOf(const HappeningRow& row) {
  return {{"time", shown(row.time)},
          {"text", shown(row.text)},
          {"record", shown(row.record)},
          {"kind", shown(nameOf(row.kind))},
          {"kindName", shown(row.kindName)},
          {"technology", shown(row.technology)},
          {"timeMs", static_cast<double>(row.timeMs)},
          {"spoken", shown(row.spoken)}};
}

QVariantMap contentOf(const KindChoice& choice) {
  return {{"kind", shown(nameOf(choice.kind))},
          {"name", shown(choice.name)},
          {"count", static_cast<int>(choice.count)},
          {"shown", choice.isShown}};
}

}  // namespace

void HappeningsModel::take(HappeningsPage page) {
  std::vector<RowsModel::Row> rows;
  rows.reserve(page.rows.size());
  for (const HappeningRow& row : page.rows) {
    rows.push_back({shown(row.id), shown(row.day), contentOf(row)});
  }
  _rows.take(std::move(rows));
  std::vector<RowsModel::Row> kinds;
  for (const KindChoice& choice : page.kinds) {
    kinds.push_back({shown(nameOf(choice.kind)), {}, contentOf(choice)});
  }
  _kinds.take(std::move(kinds));
  _notice = shown(page.notice);
  _older = shown(page.older);
  emit changed();
}

void HappeningsModel::toggle(const QString& kind) {
  const std::string wanted = kind.toStdString();
  for (int i = 0; i <= static_cast<int>(HappeningKind::mark); ++i) {
    const auto candidate = static_cast<HappeningKind>(i);
    if (nameOf(candidate) != wanted) continue;
    if (_filter.kinds.erase(candidate) == 0) _filter.kinds.insert(candidate);
    if (_ask) _ask();
    return;
  }
}

void HappeningsModel::showAll() {
  _filter.kinds.clear();
  if (_ask) _ask();
}

}  // namespace qel
