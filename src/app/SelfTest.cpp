#include "app/SelfTest.h"

#include <QtCore/QDeadlineTimer>
#include <QtCore/QEventLoop>
#include <QtCore/QTimer>
#include <QtGui/QImage>
#include <chrono>
#include <iostream>

#include "base/TerminalText.h"

namespace qel {
namespace {

constexpr std::chrono::seconds kFrameTimeout{5};
constexpr int kDeepestMenu = 2;  // technologies, then categories

int warnings = 0;
QtMessageHandler formerHandler = nullptr;

void countWarnings(QtMsgType type, const QMessageLogContext& context, const QString& message) {
  if (type != QtDebugMsg && type != QtInfoMsg) ++warnings;
  if (formerHandler) formerHandler(type, context, message);
}

// A picture in one colour below its first eighth, where the title stands, shows no table.
bool hasContent(const QImage& picture) {
  const QImage image = picture.convertToFormat(QImage::Format_RGB32);
  const int top = image.height() / 8;
  for (int y = top; y < image.height(); ++y) {
    for (int x = 0; x < image.width(); ++x) {
      if (image.pixel(x, y) != image.pixel(0, top)) return true;
    }
  }
  return false;
}

}  // namespace

SelfTest::SelfTest(QQuickWindow& window, Navigation& navigation)
    : _window(window), _navigation(navigation) {
  warnings = 0;
  formerHandler = qInstallMessageHandler(countWarnings);
}

SelfTest::~SelfTest() { qInstallMessageHandler(formerHandler); }

bool SelfTest::run() {
  check();
  visitChildren();
  for (const char* page : {"signals", "happenings", "recordings"}) visitPage(page);
  if (warnings > 0) fail(QString::number(warnings) + QStringLiteral(" warnings"));
  std::cerr << "qelwatch: self-test: " << _screens << " screens, " << _failures << " failures\n";
  return _failures == 0;
}

void SelfTest::visitChildren() {
  const int depth = _navigation.depth();
  const int rows = _navigation.top()->count();
  for (int row = 0; row < rows; ++row) {
    const TableModel& menu = *_navigation.top();
    const QString name = menu.data(menu.index(row), TableModel::textRole).toString();
    _path << name;
    _navigation.top()->choose(row);
    if (_navigation.depth() != depth + 1) {
      fail(QStringLiteral("does not open"));
    } else {
      check();
      if (_navigation.top()->title() != name) fail(QStringLiteral("has another title"));
      if (depth < kDeepestMenu) visitChildren();
      _navigation.back();
      if (!waitForFrame()) fail(QStringLiteral("is not left"));
    }
    _path.removeLast();
  }
}

void SelfTest::visitPage(const char* page) {
  _path << QString::fromLatin1(page);
  _navigation.open(_path.last());
  if (_navigation.topKind() != _path.last()) fail(QStringLiteral("does not open"));
  check();
  _navigation.back();
  if (!waitForFrame()) fail(QStringLiteral("is not left"));
  _path.removeLast();
}

void SelfTest::check() {
  ++_screens;
  if (!waitForFrame()) return fail(QStringLiteral("is not drawn in time"));
  if (!hasContent(_window.grabWindow())) fail(QStringLiteral("is empty"));
}

bool SelfTest::waitForFrame() {
  bool shown = false;
  QEventLoop loop;
  QObject::connect(&_window, &QQuickWindow::frameSwapped, &loop, [&] {
    shown = true;
    loop.quit();
  });
  QTimer::singleShot(kFrameTimeout, &loop, &QEventLoop::quit);
  _window.update();
  loop.exec();
  return shown;
}

void SelfTest::fail(const QString& what) {
  ++_failures;
  const QString screen = _path.isEmpty() ? QStringLiteral("first screen") : _path.join(u" / ");
  complain("qelwatch", ("self-test: " + screen + " " + what).toStdString());
}

}  // namespace qel
