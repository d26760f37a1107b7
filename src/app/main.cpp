#include <sysexits.h>

#include <QtGui/QGuiApplication>
#include <QtQml/QQmlApplicationEngine>
#include <QtQuick/QQuickWindow>
#include <csignal>
#include <cstdlib>
#include <memory>
#include <utility>

#include "app/BatchedOutput.h"
#include "app/Display.h"
#include "app/Options.h"
#include "app/PictureKeeper.h"
#include "app/SelfTest.h"
#include "app/SignalQuit.h"
#include "app/Source.h"
#include "base/CoreDumps.h"
#include "base/LogSink.h"
#include "base/SystemLogSink.h"
#include "base/TerminalText.h"
#include "ui/kit/ResourceBundle.h"
#include "ui/quick/Appearance.h"
#include "ui/quick/Navigation.h"
#include "ui/quick/QuickRunLoop.h"
#include "ui/screens/AppDelegate.h"

namespace {

const QString kName = QStringLiteral("qelwatch");

void chooseLog(const qel::Options& options) {
  using Sink = qel::SystemLogSink;
  const auto echo = options.verbose ? Sink::Echo::standardError : Sink::Echo::none;
  auto log = std::make_shared<Sink>("qelwatch", echo);
  qel::setSystemLog(std::make_shared<qel::EventLog>(std::move(log), options.loggedEvents));
}

void chooseDisplay(const qel::Options& options) {
  if (qel::hasDisplay()) return;
  const std::string kept =
      options.picture.empty() ? "" : "; the picture is kept in " + options.picture;
  qel::complain("qelwatch", "no display, drawing off screen" + kept);
  qel::useMemoryAsDisplay();
}

void nameApplication() {
  QGuiApplication::setApplicationName(kName);
  QGuiApplication::setApplicationDisplayName(kName);
  QGuiApplication::setApplicationVersion(QStringLiteral(QELWATCH_VERSION));
  QGuiApplication::setOrganizationName(kName);
  QGuiApplication::setDesktopFileName(QStringLiteral(QEL_APP_ID));
}

void findResources() {
  const QString directory = QGuiApplication::applicationDirPath() + "/../share/qelwatch";
  qel::ResourceBundle::setMain(std::make_shared<qel::DirectoryBundle>(directory.toStdString()));
}

// The interface description creates the first screens and with them the connection.
QQuickWindow* loadWindow(QQmlApplicationEngine& engine, const qel::Options& options) {
  engine.addImportPath(QStringLiteral("qrc:/qt/qml"));
  QVariantMap properties{{"source", qel::sourceInWords(options.source)}};
  if (qel::isOnPhone()) properties["flags"] = int{Qt::Window | Qt::FramelessWindowHint};
  engine.setInitialProperties(properties);
  engine.load(QStringLiteral("qrc:/qt/qml/Qelwatch/Ui/qml/Main.qml"));
  if (engine.rootObjects().isEmpty()) return nullptr;
  return qobject_cast<QQuickWindow*>(engine.rootObjects().constFirst());
}

// After the window is loaded, which makes the type known, and before its first frame.
void setAppearance(QQmlApplicationEngine& engine, const qel::Options& options) {
  const int type = qmlTypeId("Qelwatch.Ui", 1, 0, "Appearance");
  auto* appearance = engine.singletonInstance<qel::Appearance*>(type);
  if (options.theme) appearance->overrideTheme(*options.theme);
  if (options.selfTest) appearance->reduceMotion();
}

int runWindow(QQuickWindow& window, const qel::Options& options, qel::Source& source,
              const qel::QuickRunLoop& runLoop) {
  auto* navigation = window.property("navigation").value<qel::Navigation*>();
  QObject::connect(&runLoop, &qel::QuickRunLoop::worked, navigation->pages(), &qel::Pages::look);
  source.showIn(*navigation);
  if (options.selfTest) {
    return qel::SelfTest(window, *navigation).run() ? EXIT_SUCCESS : EXIT_FAILURE;
  }
  std::unique_ptr<qel::PictureKeeper> keeper;
  if (!options.picture.empty()) {
    keeper = std::make_unique<qel::PictureKeeper>(window, QString::fromStdString(options.picture));
  }
  return QGuiApplication::exec();
}

}  // namespace

int main(int argc, char** argv) {
  int exitCode = EXIT_SUCCESS;
  const auto options = qel::parseOptions(argc, argv, exitCode);
  if (!options) return exitCode;
  qel::leaveNoCore();
  std::signal(SIGXFSZ, SIG_IGN);  // a file at its limit shows as a failed write
  chooseLog(*options);
  const qel::SessionFolder sessionFolder;
  qel::Source source;
  exitCode = source.open(*options);
  if (exitCode != EXIT_SUCCESS) return exitCode;
  chooseDisplay(*options);
  qel::useNoInputMethod();
  nameApplication();
  int programNameOnly = 1;
  const QGuiApplication application(programNameOnly, argv);
  const qel::SignalQuit signalQuit;
  const qel::BatchedOutput output;
  const qel::QuickRunLoop runLoop;
  findResources();
  qel::AppDelegate delegate;
  if (!delegate.didFinishLaunchingWithOptions()) return EX_SOFTWARE;
  QQmlApplicationEngine engine;
  QQuickWindow* window = loadWindow(engine, *options);
  if (!window) return EX_SOFTWARE;
  setAppearance(engine, *options);
  return runWindow(*window, *options, source, runLoop);
}
