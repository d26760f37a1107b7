#include "ui/quick/TableModel.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "ui/kit/RowDiff.h"
#include "ui/screens/Placeholders.h"

namespace qel {
namespace {

constexpr int kNoRow = -1;  // of the cell of an empty section

QString textOrNone(const std::optional<std::string>& text) {
  return text ? QString::fromStdString(*text) : QString();
}

// What stands in for values is no field but a word to the reader.
bool isNotice(const RowSnapshot& cell) {
  return cell.text && cell.detail && isPlaceholder(*cell.text, *cell.detail);
}

}  // namespace

TableModel::TableModel(std::shared_ptr<TableViewController> controller, QString previousTitle,
                       QObject* parent)
    : QAbstractListModel(parent),
      _controller(std::move(controller)),
      _previousTitle(std::move(previousTitle)) {
  _controller->loadViewIfNeeded();
  _controller->tableView()->setFace([this] { draw(); });
}

TableModel::~TableModel() { _controller->tableView()->setFace({}); }

int TableModel::rowCount(const QModelIndex& parent) const { return parent.isValid() ? 0 : count(); }

QVariant TableModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const Row& row = _rows[static_cast<std::size_t>(index.row())];
  switch (role) {
    case sectionTitleRole:
      return textOrNone(row.sectionTitle);
    case cellRole:
      return QString::fromStdString(row.cell.cellIdentifier);
    case textRole:
      return textOrNone(row.cell.text);
    case detailRole:
      return textOrNone(row.cell.detail);
    case noticeRole:
      return isNotice(row.cell);
    case changesRole:
      return row.changes;
    case tableRole:
      return QVariant::fromValue(const_cast<TableModel*>(this));
    default:
      return {};
  }
}

QHash<int, QByteArray> TableModel::roleNames() const {
  return {{sectionTitleRole, "sectionTitle"},
          {cellRole, "cell"},
          {textRole, "text"},
          {detailRole, "detail"},
          {noticeRole, "notice"},
          {changesRole, "changes"},
          {tableRole, "table"}};
}

QString TableModel::title() const { return QString::fromStdString(_controller->title()); }

bool TableModel::isBlank() const {
  return std::none_of(_rows.begin(), _rows.end(), [](const Row& row) {
    return row.cell.text || row.cell.detail || row.indexPath.row == kNoRow;
  });
}

void TableModel::choose(int row) {
  if (row < 0 || row >= count()) return;
  if (_rows[static_cast<std::size_t>(row)].indexPath.row == kNoRow) return;
  emit chosen(_rows[static_cast<std::size_t>(row)].indexPath);
}

// A section with a title and no rows keeps its title over an empty cell.
std::vector<TableModel::Row> TableModel::rowsOf(TableSnapshot snapshot) const {
  const std::string emptyCell(_controller->cellOfEmptySection());
  std::vector<Row> rows;
  int sectionIndex = 0;
  for (SectionSnapshot& section : snapshot.sections) {
    if (section.rows.empty() && section.title && !emptyCell.empty()) {
      rows.push_back({{sectionIndex, kNoRow}, section.title, {emptyCell, {}, {}}});
    }
    int rowIndex = 0;
    for (RowSnapshot& cell : section.rows) {
      rows.push_back({{sectionIndex, rowIndex++}, section.title, std::move(cell)});
    }
    ++sectionIndex;
  }
  return rows;
}

bool TableModel::isSame(const Row& a, const Row& b) {
  return a.indexPath.section == b.indexPath.section && a.cell.text == b.cell.text &&
         a.cell.cellIdentifier == b.cell.cellIdentifier && a.sectionTitle == b.sectionTitle;
}

void TableModel::draw() {
  _controller->tableView()->drawn();
  std::vector<Row> rows = rowsOf(snapshotOf(*_controller));
  if (!rows.empty()) _cellIdentifier = QString::fromStdString(rows.front().cell.cellIdentifier);
  takeRows(rows);
  takeDetails(rows);
  emit drawn();
}

// Takes out what went and puts in what came; afterwards every row is the same as the new one.
void TableModel::takeRows(const std::vector<Row>& rows) {
  const auto same = [this, &rows](std::size_t before, std::size_t after) {
    return isSame(_rows[before], rows[after]);
  };
  for (const RowStep& step : rowSteps(_rows.size(), rows.size(), same)) {
    const auto first = static_cast<std::ptrdiff_t>(step.first);
    const auto end = static_cast<std::ptrdiff_t>(step.first + step.count);
    const int last = static_cast<int>(end) - 1;
    if (step.kind == RowStep::Kind::remove) {
      beginRemoveRows({}, static_cast<int>(first), last);
      _rows.erase(_rows.begin() + first, _rows.begin() + end);
      endRemoveRows();
    } else {
      beginInsertRows({}, static_cast<int>(first), last);
      _rows.insert(_rows.begin() + first, rows.begin() + first, rows.begin() + end);
      endInsertRows();
    }
  }
}

void TableModel::takeDetails(std::vector<Row>& rows) {
  for (std::size_t i = 0; i < _rows.size(); ++i) {
    _rows[i].indexPath = rows[i].indexPath;
    if (_rows[i].cell.detail == rows[i].cell.detail) continue;
    _rows[i].cell.detail = std::move(rows[i].cell.detail);
    ++_rows[i].changes;
    const QModelIndex changed = index(static_cast<int>(i));
    emit dataChanged(changed, changed, {detailRole, noticeRole, changesRole});
  }
}

}  // namespace qel
