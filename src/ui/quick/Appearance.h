// How the window is to look: light or dark, how large its text, whether it may move.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QVariant>

class QJSEngine;
class QQmlEngine;

namespace qel {

class DesktopSettings;

// One a QML engine, GUI thread only. The user's choice is kept between runs, as is what the desktop
// last said, so that a dark desktop never sees a light first frame.
class Appearance final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_SINGLETON
  Q_PROPERTY(Theme theme READ theme WRITE setTheme NOTIFY changed)
  Q_PROPERTY(bool dark READ isDark NOTIFY changed)
  Q_PROPERTY(qreal textScale READ textScale NOTIFY changed)
  Q_PROPERTY(bool reducedMotion READ isMotionReduced NOTIFY changed)
  Q_PROPERTY(QString fixedFamily READ fixedFamily CONSTANT)
  Q_PROPERTY(bool seen READ isSeen NOTIFY seenChanged)
  Q_PROPERTY(bool keyboardInUse READ isKeyboardInUse NOTIFY keyboardInUseChanged)

 public:
  enum Theme { System, Light, Dark };
  Q_ENUM(Theme)

  explicit Appearance(QObject* parent = nullptr);

  Theme theme() const { return _theme; }
  // Keeps the choice for the next run.
  void setTheme(Theme theme);
  // For this run only, in place of what was kept.
  void overrideTheme(Theme theme);

  bool isDark() const;
  // 1 for text of the usual size.
  qreal textScale() const;
  bool isMotionReduced() const { return _reducedMotion || !_desktopAnimates; }
  // Whatever the desktop says, for this run.
  void reduceMotion();
  QString fixedFamily() const;
  // Was the last thing that the user touched the keyboard?
  bool isKeyboardInUse() const { return _keyboardInUse; }

  // Can the window be seen, or is there another before it, or no light?
  bool isSeen() const { return _seen; }

  bool eventFilter(QObject* watched, QEvent* event) override;

 signals:
  void changed();
  void keyboardInUseChanged();
  void seenChanged();

 private:
  void takeDesktopSetting(const QString& name, const QVariant& value);

  DesktopSettings* _desktop;
  Theme _theme = System;
  bool _desktopIsDark = false;
  qreal _desktopTextScale = 1;
  bool _desktopAnimates = true;
  bool _reducedMotion = false;
  bool _keyboardInUse = false;
  bool _seen = true;
};

}  // namespace qel
