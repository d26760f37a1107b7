// The recordings that are kept on this device, as the window lists them.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QTimer>

#include "ui/pages/RecordingsPage.h"
#include "ui/quick/pages/RowsModel.h"

namespace qel {

// GUI thread only. Reads what it does not know yet in pieces, while it is in sight.
class RecordingsModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(qel::RowsModel* rows READ rows CONSTANT)
  Q_PROPERTY(QString emptyText READ emptyText NOTIFY changed)
  Q_PROPERTY(QString totalText READ totalText NOTIFY changed)
  Q_PROPERTY(QString undoText READ undoText NOTIFY changed)
  Q_PROPERTY(QString error READ error NOTIFY changed)

 public:
  explicit RecordingsModel(QObject* parent = nullptr);

  RowsModel* rows() { return &_rows; }  // name, title, length, size, cells, fault, growing
  QString emptyText() const;
  QString totalText() const;
  QString undoText() const;
  QString error() const;

  // The page comes into sight, or the recording being made is another; `growing` names it.
  void enter(const std::string& growing);
  // It is left: what was deleted is gone.
  void leave();
  // The file of a row; empty: there is none with this name.
  std::string pathOf(const QString& name) const;

  Q_INVOKABLE void remove(const QString& name);
  Q_INVOKABLE void undo();

 signals:
  void changed();

 private:
  void work();
  void take();

  RecordingsPage _page;
  RowsModel _rows;
  QTimer _work;
};

}  // namespace qel
