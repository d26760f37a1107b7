#include "programs/ViewerWindow.h"

#include <QtCore/QEventLoop>
#include <QtCore/QTimer>
#include <string>

#include "base/LogSink.h"
#include "metrics/MetricValidator.h"
#include "tesk/Transport.h"
#include "ui/kit/RunLoop.h"

namespace qel::benchmarks {

using namespace std::chrono_literals;

ViewerWindow::ViewerWindow(int& argc, char** argv) {
  qputenv("XDG_CONFIG_HOME", _home.path().toLocal8Bit());
  if (qEnvironmentVariableIsEmpty("XDG_RUNTIME_DIR")) {
    qputenv("XDG_RUNTIME_DIR", _home.path().toLocal8Bit());
  }
  qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
  qputenv("QT_IM_MODULE", "none");
  _application = std::make_unique<QGuiApplication>(argc, argv);
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
  tesk::setConnector(nullptr);
  _runLoop = std::make_unique<QuickRunLoop>();
  _engine = std::make_unique<QQmlApplicationEngine>();
  _engine->addImportPath(QStringLiteral("qrc:/qt/qml"));
  _engine->load(QStringLiteral("qrc:/qt/qml/Qelwatch/Ui/qml/Main.qml"));
  if (_engine->rootObjects().isEmpty()) return;
  _window = qobject_cast<QQuickWindow*>(_engine->rootObjects().constFirst());
  _navigation = _window->property("navigation").value<Navigation*>();
}

void ViewerWindow::choose(const char* text) const {
  TableModel& menu = *_navigation->top();
  for (int row = 0; row < menu.count(); ++row) {
    if (menu.data(menu.index(row), TableModel::textRole).toString() == QLatin1StringView(text)) {
      return menu.choose(row);
    }
  }
}

bool waitForFrame(QQuickWindow& window) {
  bool shown = false;
  QEventLoop loop;
  QObject::connect(&window, &QQuickWindow::frameSwapped, &loop, [&] {
    shown = true;
    loop.quit();
  });
  QTimer::singleShot(5s, &loop, &QEventLoop::quit);
  loop.exec();
  return shown;
}

void handleEvents(std::chrono::milliseconds time) {
  QEventLoop loop;
  QTimer::singleShot(time, &loop, &QEventLoop::quit);
  loop.exec();
}

void fillStore(int number) {
  EntryList& cells = MetricValidator::shared()->myLTE.EutraNbrs;
  cells.clear();
  for (int section = 0; section < kSections; ++section) {
    Dictionary cell;
    for (int row = 0; row < kRowsEach; ++row) {
      cell.set("field_name_" + std::to_string(row), number + section * kRowsEach + row);
    }
    cells.push_back(std::move(cell));
  }
}

void tick() {
  RunLoop::main().fireDue(*RunLoop::main().nextDue());
  QCoreApplication::sendPostedEvents();
}

}  // namespace qel::benchmarks
