// What the desktop says about colours, text size and motion, over its settings portal.
#pragma once

#include <QtCore/QLatin1StringView>
#include <QtCore/QObject>
#include <QtDBus/QDBusMessage>

class QDBusPendingCallWatcher;

namespace qel {

// Asks once and then follows changes, never waiting for an answer. A desktop without portal, or no
// session bus at all, means silence.
class DesktopSettings final : public QObject {
  Q_OBJECT

 public:
  static constexpr QLatin1StringView kColorScheme{"color-scheme"};
  static constexpr QLatin1StringView kAnimations{"enable-animations"};
  static constexpr QLatin1StringView kTextScale{"text-scaling-factor"};

  using QObject::QObject;

  void follow();

 signals:
  void settingChanged(const QString& name, const QVariant& value);

 private slots:
  void portalChanged(const QDBusMessage& signal);
  void portalAnswered(QDBusPendingCallWatcher* answer);

 private:
  void take(const QString& group, const QString& name, const QVariant& value);
};

}  // namespace qel
