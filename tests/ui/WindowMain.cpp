// Runs the tests of the window with the real interface and no display. Each has the dispatcher, the
// run loop and the session bus of a process to itself: several are run one after the other, each in
// a process of its own.

#include <gtest/gtest.h>

#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtGui/QGuiApplication>
#include <cstdlib>

namespace {

class OwnProcesses final : public ::testing::EmptyTestEventListener {
  void OnTestProgramStart(const ::testing::UnitTest& all) override {
    if (all.test_to_run_count() < 2) return;
    int failures = 0;
    for (int i = 0; i < all.total_test_suite_count(); ++i) {
      const ::testing::TestSuite& suite = *all.GetTestSuite(i);
      for (int k = 0; k < suite.total_test_count(); ++k) {
        if (suite.GetTestInfo(k)->should_run()) failures += run(*suite.GetTestInfo(k)) == 0 ? 0 : 1;
      }
    }
    std::printf("%d of %d tests failed\n", failures, all.test_to_run_count());
    std::exit(failures == 0 ? EXIT_SUCCESS : EXIT_FAILURE);
  }

  static int run(const ::testing::TestInfo& test) {
    const QString name = QString::fromLatin1(test.test_suite_name()) + u'.' + test.name();
    return QProcess::execute(QCoreApplication::applicationFilePath(),
                             {QStringLiteral("--gtest_filter=") + name});
  }
};

}  // namespace

int main(int argc, char** argv) {
  ::testing::InitGoogleTest(&argc, argv);
  static const QTemporaryDir home;
  qputenv("QT_QPA_PLATFORM", "offscreen");
  qputenv("XDG_CONFIG_HOME", home.path().toLocal8Bit());
  qputenv("XDG_DATA_HOME", home.path().toLocal8Bit());
  qputenv("XDG_RUNTIME_DIR", home.path().toLocal8Bit());
  qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
  QGuiApplication::setApplicationName(QStringLiteral("qelwatch"));
  QGuiApplication::setApplicationDisplayName(QStringLiteral("qelwatch"));
  QGuiApplication::setOrganizationName(QStringLiteral("qelwatch"));
  const QGuiApplication application(argc, argv);
  ::testing::UnitTest::GetInstance()->listeners().Append(new OwnProcesses);
  return RUN_ALL_TESTS();
}
