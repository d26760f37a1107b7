#include "ui/quick/Navigation.h"

#include <utility>

#include "base/FatalError.h"

namespace qel {

Navigation::Navigation(QObject* parent) : QAbstractListModel(parent) {}

Navigation::~Navigation() {
  if (_controller) _controller->setObserver({});
}

void Navigation::componentComplete() {
  if (!_storyboard) fatalError("the interface description has no storyboard");
  const auto first = _storyboard->makeScreen(_storyboard->initialScreen.toStdString());
  if (!first) fatalError("the interface description names no first screen");
  first->setTitle(_storyboard->initialTitle.toStdString());
  _controller = std::make_shared<RootNavigationController>(first);
  _controller->setObserver([this] { stackChanged(); });
  stackChanged();
  // Its commands wait for the service, and the window has yet to be shown.
  QMetaObject::invokeMethod(
      this, [this] { _controller->loadViewIfNeeded(); }, Qt::QueuedConnection);
}

int Navigation::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(_screens.size());
}

QVariant Navigation::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid) || role != tableRole) return {};
  return QVariant::fromValue(_screens[static_cast<std::size_t>(index.row())]);
}

QHash<int, QByteArray> Navigation::roleNames() const { return {{tableRole, "table"}}; }

TableModel* Navigation::top() const {
  return _depth == 0 ? nullptr : _screens[static_cast<std::size_t>(_depth - 1)];
}

void Navigation::setNotice(const QString& notice) {
  if (std::exchange(_notice, notice) != notice) emit noticeChanged();
}

void Navigation::setLoss(const QString& loss) {
  if (std::exchange(_loss, loss) != loss) emit lossChanged();
}

void Navigation::setCondition(const QString& condition) {
  if (std::exchange(_condition, condition) != condition) emit conditionChanged();
}

void Navigation::back() { _controller->popViewController(); }

void Navigation::settle() {
  const int left = rowCount() - _depth;
  if (left <= 0) return;
  beginRemoveRows({}, _depth, rowCount() - 1);
  for (int i = 0; i < left; ++i) {
    _screens.back()->deleteLater();
    _screens.pop_back();
  }
  endRemoveRows();
}

void Navigation::follow(const TableModel* table, IndexPath indexPath) {
  if (table == top()) followRow(*_controller, *_storyboard, indexPath);
}

void Navigation::stackChanged() {
  const auto& stack = _controller->viewControllers();
  const int depth = static_cast<int>(stack.size());
  if (depth > _depth) {
    settle();
    for (int i = _depth; i < depth; ++i) {
      show(std::dynamic_pointer_cast<TableViewController>(stack[static_cast<std::size_t>(i)]));
    }
  }
  _depth = depth;
  emit depthChanged();
}

void Navigation::show(const std::shared_ptr<TableViewController>& controller) {
  if (!controller) fatalError("the window shows tables only");
  const QString previousTitle = _screens.empty() ? QString() : _screens.back()->title();
  auto* table = new TableModel(controller, previousTitle, this);
  connect(table, &TableModel::chosen, this,
          [this, table](IndexPath indexPath) { follow(table, indexPath); });
  beginInsertRows({}, rowCount(), rowCount());
  _screens.push_back(table);
  endInsertRows();
}

}  // namespace qel
