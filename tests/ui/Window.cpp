#include "ui/Window.h"

#include <QtCore/QQueue>
#include <QtTest/QTest>
#include <algorithm>
#include <set>
#include <utility>

#include "base/DispatchQueue.h"
#include "ui/kit/RunLoop.h"

namespace qel::testing {
namespace {

int warningCount = 0;

void countWarnings(QtMsgType type, const QMessageLogContext&, const QString& message) {
  if (type != QtDebugMsg && type != QtInfoMsg) ++warningCount;
  std::fprintf(stderr, "%s\n", qPrintable(message));
}

QString textOf(const QQuickItem& item) {
  return item.inherits("QQuickText") ? item.property("text").toString() : QString();
}

// Breaks that only guide the layout are not part of the text.
std::string plain(QString text) { return text.remove(QChar(0x200B)).toStdString(); }

bool isInSight(const QQuickItem& item) {
  const QRectF area = item.mapRectToScene(item.boundingRect());
  return item.isVisible() && QRectF(item.window()->contentItem()->boundingRect()).intersects(area);
}

}  // namespace

Window::Window(bool animated, std::shared_ptr<FakeService> service)
    : _service(service ? std::move(service) : installFakeService()) {
  warningCount = 0;
  qInstallMessageHandler(countWarnings);
  _engine->addImportPath(QStringLiteral("qrc:/qt/qml"));
  _engine->setInitialProperties({{"source", "Test modem"}});
  _engine->load(QStringLiteral("qrc:/qt/qml/Qelwatch/Ui/qml/Main.qml"));
  if (_engine->rootObjects().isEmpty()) qFatal("the interface did not load");
  _window = qobject_cast<QQuickWindow*>(_engine->rootObjects().constFirst());
  _navigation = _window->property("navigation").value<Navigation*>();
  _appearance =
      _engine->singletonInstance<Appearance*>(qmlTypeId("Qelwatch.Ui", 1, 0, "Appearance"));
  QObject::connect(&_runLoop, &QuickRunLoop::worked, _navigation->pages(), &Pages::look);
  if (!animated) _appearance->reduceMotion();
  settle();
  if (!QTest::qWaitForWindowActive(_window)) qFatal("the window does not come to the front");
}

bool Window::tap(const std::string& text) const {
  const QQuickItem* item = find(text);
  if (!item) return false;
  tap(*item);
  return true;
}

void Window::tap(const QQuickItem& item) const {
  const QPointF middle = item.mapToScene(item.boundingRect().center());
  QTest::mouseClick(_window, Qt::LeftButton, Qt::NoModifier, middle.toPoint());
  settle();
}

void Window::press(Qt::Key key) const {
  QTest::keyClick(_window, key);
  settle();
}

bool Window::open(const std::string& technology, const std::string& category) const {
  while (_navigation->depth() > 1) _navigation->back();
  settle();
  if (!tap(technology)) return false;
  for (int row = 0; row < top().count(); ++row) {
    if (top().data(top().index(row), TableModel::textRole).toString().toStdString() != category) {
      continue;
    }
    QMetaObject::invokeMethod(list(), "positionViewAtIndex", Q_ARG(int, row), Q_ARG(int, 4));
    settle();
    tap(*this->row(row));
    return true;
  }
  return false;
}

std::vector<std::string> Window::texts() const {
  std::vector<std::pair<QPoint, std::string>> placed;
  for (const QQuickItem* item : itemsInSight()) {
    const QString text = textOf(*item);
    if (text.isEmpty()) continue;
    const QPoint place = item->mapToScene(QPointF(0, item->baselineOffset())).toPoint();
    placed.emplace_back(QPoint(place.y(), place.x()), plain(text));
  }
  std::sort(placed.begin(), placed.end(), [](const auto& a, const auto& b) {
    return std::pair(a.first.x(), a.first.y()) < std::pair(b.first.x(), b.first.y());
  });
  std::vector<std::string> texts;
  for (auto& [place, text] : placed) texts.push_back(std::move(text));
  return texts;
}

std::vector<QQuickItem*> Window::itemsInSight() const {
  std::vector<QQuickItem*> found;
  QQueue<QQuickItem*> waiting;
  waiting.enqueue(_window->contentItem());
  while (!waiting.isEmpty()) {
    QQuickItem* item = waiting.dequeue();
    if (!item->isVisible()) continue;
    if (item != _window->contentItem() && isInSight(*item)) found.push_back(item);
    for (QQuickItem* child : item->childItems()) waiting.enqueue(child);
  }
  return found;
}

bool Window::shows(const std::string& text) const {
  const auto all = texts();
  return std::find(all.begin(), all.end(), text) != all.end();
}

QQuickItem* Window::find(const std::string& text) const {
  QQuickItem* found = nullptr;
  for (QQuickItem* item : itemsInSight()) {
    if (plain(item->property("text").toString()) == text) found = item;
  }
  return found;
}

QQuickItem* Window::list() const {
  QQuickItem* found = nullptr;
  for (QQuickItem* item : itemsInSight()) {
    if (item->inherits("QQuickListView")) found = item;
  }
  return found;
}

QQuickItem* Window::row(int index) const {
  QQuickItem* item = nullptr;
  if (list()) {
    QMetaObject::invokeMethod(list(), "itemAtIndex", Q_RETURN_ARG(QQuickItem*, item),
                              Q_ARG(int, index));
  }
  return item;
}

void Window::refresh() const {
  if (const auto due = RunLoop::main().nextDue()) RunLoop::main().fireDue(*due);
  settle();
}

void Window::settle() const {
  _window->grabWindow();
  QCoreApplication::sendPostedEvents();
  QCoreApplication::processEvents();
  _window->grabWindow();
}

int Window::warnings() const { return warningCount; }

}  // namespace qel::testing
