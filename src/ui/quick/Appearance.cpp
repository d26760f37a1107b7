#include "ui/quick/Appearance.h"

#include <QtCore/QEvent>
#include <QtCore/QSettings>
#include <QtGui/QFontDatabase>
#include <QtGui/QGuiApplication>
#include <QtGui/QWindow>
#include <algorithm>
#include <utility>

#include "ui/quick/DesktopSettings.h"

namespace qel {
namespace {

constexpr auto kThemeKey = "appearance/theme";
constexpr auto kDesktopIsDarkKey = "appearance/desktopWasDark";
constexpr uint kDesktopPrefersDark = 1;
constexpr qreal kUsualPointSize = 11;  // platforms start between 9 and 11

}  // namespace

Appearance::Appearance(QObject* parent) : QObject(parent), _desktop(new DesktopSettings(this)) {
  const QSettings settings;
  const int kept = settings.value(kThemeKey, System).toInt();
  if (kept >= System && kept <= Dark) _theme = static_cast<Theme>(kept);
  _desktopIsDark = settings.value(kDesktopIsDarkKey, false).toBool();
  connect(_desktop, &DesktopSettings::settingChanged, this, &Appearance::takeDesktopSetting);
  _desktop->follow();
  qApp->installEventFilter(this);
}

void Appearance::setTheme(Theme theme) {
  QSettings().setValue(kThemeKey, theme);
  overrideTheme(theme);
}

void Appearance::overrideTheme(Theme theme) {
  if (std::exchange(_theme, theme) != theme) emit changed();
}

void Appearance::reduceMotion() {
  _reducedMotion = true;
  emit changed();
}

bool Appearance::isDark() const { return _theme == System ? _desktopIsDark : _theme == Dark; }

qreal Appearance::textScale() const {
  const qreal fontScale = QGuiApplication::font().pointSizeF() / kUsualPointSize;
  return std::max({qreal(1), fontScale, _desktopTextScale});
}

QString Appearance::fixedFamily() const {
  return QFontDatabase::systemFont(QFontDatabase::FixedFont).family();
}

bool Appearance::eventFilter(QObject* watched, QEvent* event) {
  const QEvent::Type type = event->type();
  const bool isKey = type == QEvent::KeyPress;
  const bool isTouch = type == QEvent::MouseButtonPress || type == QEvent::TouchBegin;
  if ((isKey || isTouch) && std::exchange(_keyboardInUse, isKey) != isKey) {
    emit keyboardInUseChanged();
  }
  if (type == QEvent::Expose && watched->isWindowType()) {
    const bool exposed = static_cast<QWindow*>(watched)->isExposed();
    if (std::exchange(_seen, exposed) != exposed) emit seenChanged();
  }
  return QObject::eventFilter(watched, event);
}

void Appearance::takeDesktopSetting(const QString& name, const QVariant& value) {
  if (name == DesktopSettings::kColorScheme) {
    _desktopIsDark = value.toUInt() == kDesktopPrefersDark;
    QSettings().setValue(kDesktopIsDarkKey, _desktopIsDark);
  } else if (name == DesktopSettings::kAnimations) {
    _desktopAnimates = value.toBool();
  } else if (name == DesktopSettings::kTextScale) {
    _desktopTextScale = value.toReal();
  }
  emit changed();
}

}  // namespace qel
