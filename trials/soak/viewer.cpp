// soak-viewer --bus ADDRESS SCREENS SECONDS: the viewer, whose reader opens and leaves so many
// category screens in that time, and which counts what it is told. On SIGTERM it prints the counts.

#include <QtCore/QTimer>
#include <QtGui/QGuiApplication>
#include <QtQml/QQmlApplicationEngine>
#include <QtQuick/QQuickWindow>
#include <atomic>
#include <cstdint>
#include <iostream>
#include <memory>
#include <string_view>

#include "app/Options.h"
#include "app/SignalQuit.h"
#include "app/Source.h"
#include "base/LogSink.h"
#include "connection/TeskWrapper.h"
#include "ui/kit/ResourceBundle.h"
#include "ui/quick/Navigation.h"
#include "ui/quick/QuickRunLoop.h"
#include "ui/screens/AppDelegate.h"

namespace qel::trials {
namespace {

// Counts by the viewer's own lines.
class CountingOutput final : public LogSink {
 public:
  void write(std::string_view line) override {
    if (line.starts_with("Metric ID in Hex")) ++_metrics;
    if (line == "I dont care for events") ++_triggers;
  }
  std::uint64_t metrics() const { return _metrics; }
  std::uint64_t triggers() const { return _triggers; }

 private:
  std::atomic<std::uint64_t> _metrics = 0;
  std::atomic<std::uint64_t> _triggers = 0;
};

// Goes through all categories of all technologies, in turn.
class Reader {
 public:
  Reader(Navigation& navigation, int screens, int seconds)
      : _navigation(navigation), _screens(screens) {
    _timer.setInterval(std::max(1, seconds * 800 / (2 * screens)));
    QObject::connect(&_timer, &QTimer::timeout, &_timer, [this] { step(); });
    _timer.start();
  }
  int opened() const { return _opened; }

 private:
  static constexpr int kCategory = 3;  // depth of a category's screen

  void step() {
    _navigation.settle();
    if (_opened >= _screens && _navigation.depth() < kCategory) return _timer.stop();
    if (_navigation.depth() == kCategory) return _navigation.back();
    TableModel& menu = *_navigation.top();
    int& row = _navigation.depth() == 1 ? _technology : _category;
    if (row >= menu.count()) {
      row = 0;
      if (_navigation.depth() > 1) _navigation.back();
      return;
    }
    menu.choose(row++);
    if (_navigation.depth() == kCategory) ++_opened;
  }

  Navigation& _navigation;
  const int _screens;
  int _opened = 0;
  int _technology = 0;
  int _category = 0;
  QTimer _timer;
};

int run(int argc, char** argv) {
  Options options;
  options.bus = argv[2];
  Source source;
  if (const int failed = source.open(options)) return failed;
  const QGuiApplication application(argc, argv);
  const SignalQuit signalQuit;
  const auto output = std::make_shared<CountingOutput>();
  setStandardOutput(output);
  setSystemLog(nullptr);
  const QuickRunLoop runLoop;
  ResourceBundle::setMain(std::make_shared<DirectoryBundle>(QEL_RESOURCES));
  AppDelegate delegate;
  if (!delegate.didFinishLaunchingWithOptions()) return EXIT_FAILURE;
  QQmlApplicationEngine engine;
  engine.addImportPath(QStringLiteral("qrc:/qt/qml"));
  engine.setInitialProperties({{"source", sourceInWords("")}});
  engine.load(QStringLiteral("qrc:/qt/qml/Qelwatch/Ui/qml/Main.qml"));
  if (engine.rootObjects().isEmpty()) return EXIT_FAILURE;
  auto& navigation =
      *engine.rootObjects().constFirst()->property("navigation").value<Navigation*>();
  source.showIn(navigation);
  const Reader reader(navigation, std::stoi(argv[3]), std::stoi(argv[4]));
  QGuiApplication::exec();
  std::cout << "screens " << reader.opened() << "\nmetrics " << output->metrics() << "\ntriggers "
            << output->triggers() << "\ndropped " << TeskWrapper::sharedInstance()->droppedEvents()
            << std::endl;
  return EXIT_SUCCESS;
}

}  // namespace
}  // namespace qel::trials

int main(int argc, char** argv) {
  if (argc != 5) {
    std::cerr << "soak-viewer --bus ADDRESS SCREENS SECONDS\n";
    return 64;
  }
  return qel::trials::run(argc, argv);
}
