// screen-work [screens]: what the viewer's window costs, on a category screen that is seen or once
// a thousand were left. Prints table rows. The window is the real one, with the store filled by
// hand and no service.

#include <QtCore/QStringListModel>
#include <QtCore/QTemporaryDir>
#include <QtCore/QTimer>
#include <QtGui/QGuiApplication>
#include <QtQml/QQmlApplicationEngine>
#include <QtQml/QQmlContext>
#include <QtQuick/QQuickWindow>
#include <functional>
#include <string_view>

#include "metrics/MetricValidator.h"
#include "programs/Figures.h"
#include "tesk/Transport.h"
#include "ui/kit/RunLoop.h"
#include "ui/quick/Navigation.h"
#include "ui/quick/QuickRunLoop.h"

namespace qel::benchmarks {
namespace {

using namespace std::chrono_literals;

constexpr int kSections = 20;
constexpr int kRowsEach = 10;
constexpr int kRedraws = 100;
constexpr int kScreens = 1000;
constexpr auto kWatched = 20s;

void handleEvents(std::chrono::milliseconds time) {
  QEventLoop loop;
  QTimer::singleShot(time, &loop, &QEventLoop::quit);
  loop.exec();
}

// Handles events until the window has shown another frame.
void waitForFrame(QQuickWindow& window) {
  QEventLoop loop;
  QObject::connect(&window, &QQuickWindow::frameSwapped, &loop, &QEventLoop::quit);
  QTimer::singleShot(5s, &loop, &QEventLoop::quit);
  loop.exec();
}

// 200 rows whose values carry the number.
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

void choose(Navigation& navigation, const QString& text) {
  TableModel& menu = *navigation.top();
  for (int row = 0; row < menu.count(); ++row) {
    if (menu.data(menu.index(row), TableModel::textRole).toString() == text) menu.choose(row);
  }
}

// Processor time in µs of what happens between the call and the end of the work that it caused.
double cost(const std::function<void()>& work) {
  const auto before = processorTime();
  work();
  return Microseconds(processorTime() - before).count();
}

double medianCost(const std::function<void()>& prepare, const std::function<void()>& work) {
  std::vector<double> costs;
  for (int i = 0; i < kRedraws; ++i) {
    prepare();
    costs.push_back(cost(work));
  }
  return median(costs);
}

// The five seconds are over: every timer fires and the queue is worked off.
void tick() {
  RunLoop::main().fireDue(*RunLoop::main().nextDue());
  QCoreApplication::sendPostedEvents();
}

// The same rows as a list whose model is reset, as they would be without a comparison.
class PlainList {
 public:
  PlainList() {
    _engine.rootContext()->setContextProperty("rows", &_rows);
    _engine.loadData(R"(
      import QtQuick
      Window {
          width: 360; height: 720; visible: true
          ListView {
              anchors.fill: parent
              model: rows
              delegate: Row {
                  required property string display
                  height: 48; spacing: 16
                  Text { text: "field_name" }
                  Text { text: parent.display }
              }
          }
      })");
  }
  QQuickWindow& window() {
    return *qobject_cast<QQuickWindow*>(_engine.rootObjects().constFirst());
  }
  void fill(int number) {
    QStringList texts;
    for (int row = 0; row < kSections * kRowsEach; ++row) texts << QString::number(number + row);
    _rows.setStringList(texts);
  }

 private:
  QStringListModel _rows;
  QQmlApplicationEngine _engine;
};

void measurePlainList(double& same, double& changed) {
  PlainList list;
  list.fill(0);
  handleEvents(200ms);
  const auto redraw = [&list](int number) {
    list.fill(number);
    waitForFrame(list.window());
  };
  same = medianCost([] {}, [&] { redraw(0); });
  int number = 0;
  changed = medianCost([] {}, [&] { redraw(number += 1000); });
}

std::string perTick(double microseconds) { return text(microseconds / 1000, "ms", 3); }

void measureRedraw(QQuickWindow& window, Navigation& navigation) {
  int number = 0;
  fillStore(number);
  choose(navigation, QStringLiteral("EUTRA Neighbor Info"));
  handleEvents(1s);
  const auto change = [&number] { fillStore(number += 1000); };
  const double same = medianCost([] {}, tick);
  const double compared = medianCost(change, tick);
  const auto tickAndDraw = [&window] {
    tick();
    waitForFrame(window);
  };
  handleEvents(1s);
  const double drawn = medianCost(
      [&] {
        handleEvents(1ms);
        change();
      },
      tickAndDraw);
  std::vector<double> wholes;
  for (int i = 0; i < 7; ++i) {
    change();
    wholes.push_back(cost([] {
      tick();
      handleEvents(1s);
    }));
  }
  double plainSame = 0;
  double plainChanged = 0;
  measurePlainList(plainSame, plainChanged);
  const std::string beside = ": a list whose model is reset";
  printRow("redraw of 200 rows, nothing changed", perTick(same), perTick(plainSame) + beside,
           "< 0.1 ms");
  printRow("redraw of 200 rows, all changed, up to its frame", perTick(drawn),
           perTick(plainChanged) + beside, "< 4 ms");
  printRow("of that the comparison, without the frame", perTick(compared), "", "");
  printRow("with the highlight that fades after it", perTick(median(wholes)), "", "");
}

struct Watched {
  double percent;
  double wakeUpsEachSecond;
};

Watched watch() {
  handleEvents(1s);
  const auto time = processorTime();
  const auto wakes = wakeUps();
  handleEvents(kWatched);
  const double seconds = std::chrono::duration<double>(kWatched).count();
  const double used = std::chrono::duration<double>(processorTime() - time).count();
  return {100 * used / seconds, static_cast<double>(wakeUps() - wakes) / seconds};
}

std::string watchedText(const Watched& watched) {
  return text(watched.percent, "% of a core, ", 3) + text(watched.wakeUpsEachSecond, "wake-ups/s");
}

void openAndLeave(Navigation& navigation, int times) {
  for (int i = 0; i < times; ++i) {
    choose(navigation, QStringLiteral("EUTRA Neighbor Info"));
    QCoreApplication::processEvents();
    navigation.back();
    QCoreApplication::processEvents();
    navigation.settle();
  }
}

void measureScreens(Navigation& navigation) {
  openAndLeave(navigation, 1);
  const Watched before = watch();
  openAndLeave(navigation, kScreens);
  const Watched after = watch();
  printRow("1,000 category screens opened and left", watchedText(after),
           watchedText(before) + ": one", "< 0.5 %, no more wake-ups");
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel;
  using namespace qel::benchmarks;
  const QTemporaryDir home;
  qputenv("QT_QPA_PLATFORM", "offscreen");
  qputenv("XDG_CONFIG_HOME", home.path().toLocal8Bit());
  qputenv("XDG_RUNTIME_DIR", home.path().toLocal8Bit());
  qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
  const QGuiApplication application(argc, argv);
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
  tesk::setConnector(nullptr);
  const QuickRunLoop runLoop;
  QQmlApplicationEngine engine;
  engine.addImportPath(QStringLiteral("qrc:/qt/qml"));
  engine.load(QStringLiteral("qrc:/qt/qml/Qelwatch/Ui/qml/Main.qml"));
  if (engine.rootObjects().isEmpty()) return 1;
  auto& window = *qobject_cast<QQuickWindow*>(engine.rootObjects().constFirst());
  auto& navigation = *window.property("navigation").value<Navigation*>();
  handleEvents(1s);
  choose(navigation, QStringLiteral("LTE"));
  handleEvents(1s);
  if (argc == 2 && std::string_view(argv[1]) == "screens") {
    measureScreens(navigation);
  } else {
    measureRedraw(window, navigation);
  }
}
