#include "ui/quick/DesktopSettings.h"

#include <QtCore/QFileInfo>
#include <QtCore/QMap>
#include <QtCore/QVariantMap>
#include <QtDBus/QDBusConnection>
#include <QtDBus/QDBusMessage>
#include <QtDBus/QDBusMetaType>
#include <QtDBus/QDBusPendingCallWatcher>
#include <QtDBus/QDBusPendingReply>
#include <QtDBus/QDBusVariant>
#include <algorithm>
#include <array>

namespace qel {
namespace {

using Groups = QMap<QString, QVariantMap>;

constexpr QLatin1StringView kService{"org.freedesktop.portal.Desktop"};
constexpr QLatin1StringView kPath{"/org/freedesktop/portal/desktop"};
constexpr QLatin1StringView kInterface{"org.freedesktop.portal.Settings"};

struct Setting {
  QLatin1StringView group;
  QLatin1StringView name;
};

constexpr std::array kSettings = {
    Setting{QLatin1StringView("org.freedesktop.appearance"), DesktopSettings::kColorScheme},
    Setting{QLatin1StringView("org.gnome.desktop.interface"), DesktopSettings::kAnimations},
    Setting{QLatin1StringView("org.gnome.desktop.interface"), DesktopSettings::kTextScale},
};

// Asking without one may start a bus that nobody ends.
bool hasSessionBus() {
  if (qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS")) return true;
  const QString runtime = qEnvironmentVariable("XDG_RUNTIME_DIR");
  return !runtime.isEmpty() && QFileInfo::exists(runtime + QLatin1StringView("/bus"));
}

}  // namespace

void DesktopSettings::follow() {
  if (!hasSessionBus()) return;
  QDBusConnection bus = QDBusConnection::sessionBus();
  if (!bus.isConnected()) return;
  qDBusRegisterMetaType<Groups>();
  bus.connect(kService, kPath, kInterface, QLatin1StringView("SettingChanged"), this,
              SLOT(portalChanged(QDBusMessage)));
  QDBusMessage question =
      QDBusMessage::createMethodCall(kService, kPath, kInterface, QLatin1StringView("ReadAll"));
  QStringList groups;
  for (const Setting& setting : kSettings) groups << setting.group;
  groups.removeDuplicates();
  question << groups;
  auto* answer = new QDBusPendingCallWatcher(bus.asyncCall(question), this);
  connect(answer, &QDBusPendingCallWatcher::finished, this, &DesktopSettings::portalAnswered);
}

void DesktopSettings::portalAnswered(QDBusPendingCallWatcher* answer) {
  answer->deleteLater();
  const QDBusPendingReply<Groups> reply = *answer;
  if (reply.isError()) return;
  const Groups groups = reply.value();
  for (auto group = groups.begin(); group != groups.end(); ++group) {
    for (auto setting = group->begin(); setting != group->end(); ++setting) {
      take(group.key(), setting.key(), setting.value());
    }
  }
}

void DesktopSettings::portalChanged(const QDBusMessage& signal) {
  const QList<QVariant> arguments = signal.arguments();
  if (signal.signature() != QLatin1StringView("ssv")) return;
  take(arguments[0].toString(), arguments[1].toString(),
       arguments[2].value<QDBusVariant>().variant());
}

void DesktopSettings::take(const QString& group, const QString& name, const QVariant& value) {
  const auto matches = [&](const Setting& setting) {
    return setting.group == group && setting.name == name;
  };
  if (std::any_of(kSettings.begin(), kSettings.end(), matches)) emit settingChanged(name, value);
}

}  // namespace qel
