// The desktop's settings portal, played by this test on a bus of its own.

#include "ui/quick/DesktopSettings.h"

#include <gtest/gtest.h>

#include <QtCore/QProcess>
#include <QtDBus/QDBusConnection>
#include <QtDBus/QDBusMessage>
#include <QtDBus/QDBusMetaType>
#include <QtTest/QTest>
#include <vector>

#include "ui/quick/Appearance.h"

namespace qel {

using Groups = QMap<QString, QVariantMap>;

class FakePortal final : public QObject {
  Q_OBJECT
  Q_CLASSINFO("D-Bus Interface", "org.freedesktop.portal.Settings")

 public:
  Groups groups;

 public slots:
  QMap<QString, QVariantMap> ReadAll(const QStringList& wanted) const {
    Groups answer;
    for (const QString& group : wanted) {
      if (groups.contains(group)) answer[group] = groups[group];
    }
    return answer;
  }
};

namespace {

constexpr auto kPath = "/org/freedesktop/portal/desktop";
constexpr auto kColours = "org.freedesktop.appearance";
constexpr auto kDesktop = "org.gnome.desktop.interface";

class DesktopSettingsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    daemon.start(QStringLiteral("dbus-daemon"),
                 {QStringLiteral("--session"), QStringLiteral("--nofork"),
                  QStringLiteral("--nopidfile"), QStringLiteral("--print-address")});
    ASSERT_TRUE(daemon.waitForReadyRead()) << "the bus daemon does not start";
    const QByteArray address = daemon.readAllStandardOutput().trimmed();
    qputenv("DBUS_SESSION_BUS_ADDRESS", address);
    qDBusRegisterMetaType<Groups>();
    QDBusConnection bus = QDBusConnection::connectToBus(QString::fromLatin1(address), "portal");
    ASSERT_TRUE(bus.registerObject(kPath, &portal, QDBusConnection::ExportAllSlots));
    ASSERT_TRUE(bus.registerService("org.freedesktop.portal.Desktop"));
  }

  void TearDown() override {
    QDBusConnection::disconnectFromBus("portal");
    daemon.kill();
    daemon.waitForFinished();
  }

  void change(const char* group, const char* name, const QVariant& value) {
    QDBusMessage signal =
        QDBusMessage::createSignal(kPath, "org.freedesktop.portal.Settings", "SettingChanged");
    signal << group << name << QVariant::fromValue(QDBusVariant(value));
    QDBusConnection("portal").send(signal);
  }

  QProcess daemon;
  FakePortal portal;
};

TEST_F(DesktopSettingsTest, areReadOnceAndThenFollowed) {
  portal.groups[kColours]["color-scheme"] = 1U;
  Appearance appearance;
  EXPECT_FALSE(appearance.isDark()) << "the start does not wait for the answer";
  EXPECT_TRUE(QTest::qWaitFor([&] { return appearance.isDark(); }));
  change(kColours, "color-scheme", 2U);
  EXPECT_TRUE(QTest::qWaitFor([&] { return !appearance.isDark(); }));
}

TEST_F(DesktopSettingsTest, giveWayToTheUsersChoice) {
  portal.groups[kColours]["color-scheme"] = 1U;
  Appearance appearance;
  ASSERT_TRUE(QTest::qWaitFor([&] { return appearance.isDark(); }));
  appearance.setTheme(Appearance::Light);
  EXPECT_FALSE(appearance.isDark());
}

TEST_F(DesktopSettingsTest, areRememberedForTheNextFirstFrame) {
  portal.groups[kColours]["color-scheme"] = 1U;
  const Appearance before;
  ASSERT_TRUE(QTest::qWaitFor([&] { return before.isDark(); }));
  const Appearance next;
  EXPECT_TRUE(next.isDark());
}

TEST_F(DesktopSettingsTest, sayHowLargeTextIsAndWhetherThingsMayMove) {
  portal.groups[kDesktop]["text-scaling-factor"] = 1.5;
  portal.groups[kDesktop]["enable-animations"] = false;
  const Appearance appearance;
  EXPECT_FALSE(appearance.isMotionReduced());
  EXPECT_TRUE(QTest::qWaitFor(
      [&] { return appearance.textScale() == 1.5 && appearance.isMotionReduced(); }));
}

TEST_F(DesktopSettingsTest, thatNobodyAskedForAreIgnored) {
  DesktopSettings settings;
  std::vector<QString> names;
  QObject::connect(&settings, &DesktopSettings::settingChanged,
                   [&names](const QString& name, const QVariant&) { names.push_back(name); });
  settings.follow();
  change(kDesktop, "cursor-size", 24);
  change("org.example", "color-scheme", 1U);
  change(kColours, "color-scheme", 1U);
  EXPECT_TRUE(QTest::qWaitFor([&names] { return !names.empty(); }));
  EXPECT_EQ(names, std::vector<QString>{"color-scheme"});
}

TEST(DesktopWithoutPortal, isLightAndStill) {
  const Appearance appearance;
  EXPECT_FALSE(appearance.isDark());
  EXPECT_EQ(appearance.textScale(), 1);
  EXPECT_FALSE(appearance.isMotionReduced());
}

}  // namespace
}  // namespace qel

#include "DesktopSettingsTest.moc"
