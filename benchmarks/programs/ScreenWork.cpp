// screen-work [screens]: what the viewer's window costs, on a category screen that is seen or once
// a thousand were left. Prints table rows. The window is the real one, with the store filled by
// hand and no service.

#include <QtCore/QStringListModel>
#include <QtQml/QQmlContext>
#include <functional>
#include <string_view>

#include "programs/Figures.h"
#include "programs/ViewerWindow.h"

namespace qel::benchmarks {
namespace {

using namespace std::chrono_literals;

constexpr int kRedraws = 100;
constexpr int kScreens = 1000;
constexpr auto kWatched = 20s;

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

void measureRedraw(const ViewerWindow& viewer) {
  int number = 0;
  fillStore(number);
  viewer.choose("EUTRA Neighbor Info");
  handleEvents(1s);
  const auto change = [&number] { fillStore(number += 1000); };
  const double same = medianCost([] {}, tick);
  const double compared = medianCost(change, tick);
  const auto tickAndDraw = [&viewer] {
    tick();
    waitForFrame(viewer.window());
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

void openAndLeave(const ViewerWindow& viewer, int times) {
  for (int i = 0; i < times; ++i) {
    viewer.choose("EUTRA Neighbor Info");
    QCoreApplication::processEvents();
    viewer.navigation().back();
    QCoreApplication::processEvents();
    viewer.navigation().settle();
  }
}

void measureScreens(const ViewerWindow& viewer) {
  openAndLeave(viewer, 1);
  const Watched before = watch();
  openAndLeave(viewer, kScreens);
  const Watched after = watch();
  printRow("1,000 category screens opened and left", watchedText(after),
           watchedText(before) + ": one", "< 0.5 %, no more wake-ups");
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  qputenv("QT_QPA_PLATFORM", "offscreen");
  const ViewerWindow viewer(argc, argv);
  if (!viewer.isThere()) return 1;
  handleEvents(1s);
  viewer.choose("LTE");
  handleEvents(1s);
  if (argc == 2 && std::string_view(argv[1]) == "screens") {
    measureScreens(viewer);
  } else {
    measureRedraw(viewer);
  }
}
