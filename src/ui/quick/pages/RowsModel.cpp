#include "ui/quick/pages/RowsModel.h"

#include <cstddef>
#include <utility>

#include "ui/kit/RowDiff.h"

namespace qel {

int RowsModel::rowCount(const QModelIndex& parent) const { return parent.isValid() ? 0 : count(); }

QVariant RowsModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const Row& row = _rows[static_cast<std::size_t>(index.row())];
  if (role == rowRole) return row.content;
  if (role == sectionRole) return row.section;
  return {};
}

QHash<int, QByteArray> RowsModel::roleNames() const {
  return {{rowRole, "row"}, {sectionRole, "section"}};
}

QString RowsModel::idAt(int row) const {
  return row >= 0 && row < count() ? _rows[static_cast<std::size_t>(row)].id : QString();
}

void RowsModel::take(std::vector<Row> rows) {
  const auto same = [this, &rows](std::size_t before, std::size_t after) {
    return _rows[before].id == rows[after].id && _rows[before].section == rows[after].section;
  };
  for (const RowStep& step : rowSteps(_rows.size(), rows.size(), same)) {
    const auto first = static_cast<std::ptrdiff_t>(step.first);
    const auto end = static_cast<std::ptrdiff_t>(step.first + step.count);
    if (step.kind == RowStep::Kind::remove) {
      beginRemoveRows({}, static_cast<int>(first), static_cast<int>(end) - 1);
      _rows.erase(_rows.begin() + first, _rows.begin() + end);
      endRemoveRows();
    } else {
      beginInsertRows({}, static_cast<int>(first), static_cast<int>(end) - 1);
      _rows.insert(_rows.begin() + first, rows.begin() + first, rows.begin() + end);
      endInsertRows();
    }
  }
  for (std::size_t i = 0; i < _rows.size(); ++i) {
    if (_rows[i].content == rows[i].content) continue;
    _rows[i].content = std::move(rows[i].content);
    const QModelIndex changed = index(static_cast<int>(i));
    emit dataChanged(changed, changed, {rowRole});
  }
  emit taken();
}

}  // namespace qel
