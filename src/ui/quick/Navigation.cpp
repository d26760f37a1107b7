#include "ui/quick/Navigation.h"

#include <algorithm>
#include <array>
#include <utility>

#include "base/FatalError.h"
#include "ui/screens/SecondLevelViewController.h"

namespace qel {
namespace {

const QString kTable = QStringLiteral("table");

struct PageFacts {
  const char* kind;
  const char* title;
};

constexpr std::array kPages = {PageFacts{"signals", "Signals"},
                               PageFacts{"happenings", "Happenings"},
                               PageFacts{"recordings", "Recordings"}};

const PageFacts* findPage(const QString& kind) {
  const auto named = [&kind](const PageFacts& page) {
    return kind == QLatin1StringView(page.kind);
  };
  const auto* found = std::ranges::find_if(kPages, named);
  return found == kPages.end() ? nullptr : found;
}

// Holds a page's place on the stack; what it shows is no table.
class PageViewController final : public ViewController {
 public:
  explicit PageViewController(const PageFacts& page) : facts(page) { setTitle(page.title); }

  const PageFacts& facts;
};

// Null for a screen that is no page.
const PageFacts* factsOf(const ViewController& screen) {
  const auto* page = dynamic_cast<const PageViewController*>(&screen);
  return page ? &page->facts : nullptr;
}

}  // namespace

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
  _pages = new Pages(this);
  emit pagesChanged();
  connect(this, &Navigation::depthChanged, _pages,
          [this] { _pages->setInSight(_depth == 1 ? QStringLiteral("first") : topKind()); });
  // At another moment of a recording the store holds other values.
  connect(_pages, &Pages::momentChanged, this, &Navigation::drawAnew);
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
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const Screen& screen = _screens[static_cast<std::size_t>(index.row())];
  switch (role) {
    case tableRole:
      return QVariant::fromValue(screen.table);
    case kindRole:
      return screen.kind;
    case titleRole:
      return screen.title;
    case subtitleRole:
      return screen.subtitle;
    case previousTitleRole:
      return screen.previousTitle;
    default:
      return {};
  }
}

QHash<int, QByteArray> Navigation::roleNames() const {
  return {{tableRole, "table"},
          {kindRole, "kind"},
          {titleRole, "title"},
          {subtitleRole, "subtitle"},
          {previousTitleRole, "previousTitle"}};
}

TableModel* Navigation::top() const {
  return _depth == 0 ? nullptr : _screens[static_cast<std::size_t>(_depth - 1)].table;
}

QString Navigation::topKind() const {
  return _depth == 0 ? QString() : _screens[static_cast<std::size_t>(_depth - 1)].kind;
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

void Navigation::open(const QString& page) {
  const PageFacts* facts = findPage(page);
  if (!facts) return;
  const auto& stack = _controller->viewControllers();
  const auto isIt = [facts](const auto& screen) { return facts == factsOf(*screen); };
  const auto found = std::ranges::find_if(stack, isIt);
  if (found == stack.end()) {
    return _controller->pushViewController(std::make_shared<PageViewController>(*facts));
  }
  for (auto above = stack.end() - found; above > 1; --above) _controller->popViewController();
}

void Navigation::settle() {
  const int left = rowCount() - _depth;
  if (left <= 0) return;
  beginRemoveRows({}, _depth, rowCount() - 1);
  for (int i = 0; i < left; ++i) {
    if (_screens.back().table) _screens.back().table->deleteLater();
    _screens.pop_back();
  }
  endRemoveRows();
}

void Navigation::follow(const TableModel* table, IndexPath indexPath) {
  if (table != top() || followRow(*_controller, *_storyboard, indexPath)) return;
  const auto category =
      std::dynamic_pointer_cast<SecondLevelViewController>(_controller->topViewController());
  if (!category || !category->tableView()) return;
  const TableViewCell* cell = category->tableView()->cellForRowAtIndexPath(indexPath);
  if (!cell || !cell->textLabel) return;
  const std::string field = cell->textLabel->text.value_or("");
  drawAnew();  // the row and its sheet tell the same
  _pages->sheet()->open({category->firstSelection.value_or(""),
                         category->seguedThroughRow.value_or(""), indexPath.section, indexPath.row,
                         field});
}

void Navigation::drawAnew() {
  const auto table =
      std::dynamic_pointer_cast<TableViewController>(_controller->topViewController());
  if (table && table->tableView()) table->tableView()->reloadData();
}

void Navigation::stackChanged() {
  const auto& stack = _controller->viewControllers();
  const int depth = static_cast<int>(stack.size());
  if (depth > _depth) {
    settle();
    for (int i = _depth; i < depth; ++i) show(stack[static_cast<std::size_t>(i)]);
  }
  _depth = depth;
  emit depthChanged();
}

void Navigation::show(const std::shared_ptr<ViewController>& controller) {
  Screen screen;
  screen.title = QString::fromStdString(controller->title());
  if (!_screens.empty()) screen.previousTitle = _screens.back().title;
  if (const PageFacts* page = factsOf(*controller)) {
    screen.kind = QLatin1StringView(page->kind);
  } else {
    screen.kind = kTable;
    auto tableController = std::dynamic_pointer_cast<TableViewController>(controller);
    if (!tableController) fatalError("the window shows tables and pages only");
    if (const auto* category = dynamic_cast<SecondLevelViewController*>(controller.get())) {
      screen.subtitle = QString::fromStdString(category->firstSelection.value_or(""));
    }
    screen.table = new TableModel(tableController, screen.previousTitle, this);
    connect(screen.table, &TableModel::chosen, this,
            [this, table = screen.table](IndexPath indexPath) { follow(table, indexPath); });
    connect(screen.table, &TableModel::drawn, _pages, &Pages::tableDrawn);
  }
  beginInsertRows({}, rowCount(), rowCount());
  _screens.push_back(screen);
  endInsertRows();
}

}  // namespace qel
