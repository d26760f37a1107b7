// Keeps a picture of the window in a file.
#pragma once

#include <QtCore/QObject>
#include <QtCore/QTimer>
#include <QtGui/QImage>
#include <QtQuick/QQuickWindow>

namespace qel {

// GUI thread only; gone before the window. Writes when what is seen has changed, at most once a
// second, and never leaves half a file. A file that cannot be written is said once on standard
// error.
class PictureKeeper final : public QObject {
 public:
  PictureKeeper(QQuickWindow& window, QString file);

 private:
  void frameShown();
  void keep();

  QQuickWindow& _window;
  QString _file;
  QImage _kept;
  QTimer _timer;
  bool _grabbing = false;
  bool _complained = false;
};

}  // namespace qel
