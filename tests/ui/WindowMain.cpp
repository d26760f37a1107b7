// Runs the tests of the window with the real interface and no display.

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>
#include <QtGui/QGuiApplication>

int main(int argc, char** argv) {
  ::testing::InitGoogleTest(&argc, argv);
  const QTemporaryDir home;
  qputenv("QT_QPA_PLATFORM", "offscreen");
  qputenv("XDG_CONFIG_HOME", home.path().toLocal8Bit());
  qputenv("XDG_DATA_HOME", home.path().toLocal8Bit());
  qputenv("XDG_RUNTIME_DIR", home.path().toLocal8Bit());
  qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
  QGuiApplication::setApplicationName(QStringLiteral("qelwatch"));
  QGuiApplication::setApplicationDisplayName(QStringLiteral("qelwatch"));
  QGuiApplication::setOrganizationName(QStringLiteral("qelwatch"));
  const QGuiApplication application(argc, argv);
  return RUN_ALL_TESTS();
}
