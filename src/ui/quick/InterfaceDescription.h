// The storyboard as it is written down in QML.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QList>
#include <QtCore/QObject>
#include <QtCore/QUrl>
#include <QtQml/QQmlComponent>
#include <QtQml/QQmlListProperty>

#include "ui/kit/Storyboard.h"

namespace qel {

// How the cells of one identifier look and which screen a tap on them opens. The look is read when
// it is first asked for.
class CellPrototype : public QObject {
  Q_OBJECT
  QML_ELEMENT
  Q_PROPERTY(QString identifier MEMBER identifier)
  Q_PROPERTY(QUrl look MEMBER look)
  Q_PROPERTY(QString opens MEMBER opens)

 public:
  using QObject::QObject;

  QString identifier;
  QUrl look;
  QString opens;  // a screen's class name; empty: none

  QQmlComponent* component();

 private:
  QQmlComponent* _component = nullptr;  // a child
};

class InterfaceDescription : public QObject, public Storyboard {
  Q_OBJECT
  QML_ELEMENT
  Q_CLASSINFO("DefaultProperty", "cells")
  Q_PROPERTY(QString initialScreen MEMBER initialScreen)
  Q_PROPERTY(QString initialTitle MEMBER initialTitle)
  Q_PROPERTY(QQmlListProperty<qel::CellPrototype> cells READ cells CONSTANT)

 public:
  using QObject::QObject;

  QString initialScreen;  // class name of the first screen
  QString initialTitle;

  QQmlListProperty<CellPrototype> cells() { return {this, &_cells}; }

  // The look of such cells, or null.
  Q_INVOKABLE QQmlComponent* lookOf(const QString& identifier) const;

  std::string destinationOfCell(std::string_view cellIdentifier) const override;
  std::shared_ptr<TableViewController> makeScreen(std::string_view className) const override;

 private:
  CellPrototype* find(const QString& identifier) const;

  QList<CellPrototype*> _cells;
};

}  // namespace qel
