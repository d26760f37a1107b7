// The navigation stack as the list of screens that the window shows.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QAbstractListModel>
#include <QtQml/QQmlParserStatus>
#include <memory>
#include <vector>

#include "ui/quick/InterfaceDescription.h"
#include "ui/quick/TableModel.h"
#include "ui/quick/pages/Pages.h"
#include "ui/screens/RootNavigationController.h"

namespace qel {

// GUI thread only. Made by the interface description; once that is read it creates the root
// navigation controller with the first screen. A screen that is left stays in the list until the
// window has moved it out of sight and says so with settle().
class Navigation : public QAbstractListModel, public QQmlParserStatus {
  Q_OBJECT
  Q_INTERFACES(QQmlParserStatus)
  QML_ELEMENT
  Q_PROPERTY(qel::InterfaceDescription* storyboard MEMBER _storyboard NOTIFY storyboardChanged)
  Q_PROPERTY(int depth READ depth NOTIFY depthChanged)
  Q_PROPERTY(qel::TableModel* top READ top NOTIFY depthChanged)
  Q_PROPERTY(QString topKind READ topKind NOTIFY depthChanged)
  Q_PROPERTY(qel::Pages* pages READ pages NOTIFY pagesChanged)
  Q_PROPERTY(QString notice READ notice WRITE setNotice NOTIFY noticeChanged)
  Q_PROPERTY(QString loss READ loss WRITE setLoss NOTIFY lossChanged)
  Q_PROPERTY(QString condition READ condition WRITE setCondition NOTIFY conditionChanged)

 public:
  // A screen is a table, or a page of the kind that it was opened by; `table` is then null.
  enum Role { tableRole = Qt::UserRole + 1, kindRole, titleRole, subtitleRole, previousTitleRole };

  explicit Navigation(QObject* parent = nullptr);
  ~Navigation() override;

  void classBegin() override {}
  void componentComplete() override;

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  // The stack itself, once the interface description is read.
  RootNavigationController& controller() const { return *_controller; }

  // Screens on the stack; the list may still hold more that were left.
  int depth() const { return _depth; }
  // The table in sight; null while a page is.
  TableModel* top() const;
  // "table", or which page is in sight.
  QString topKind() const;

  // What the pages show; null until the interface description is read.
  Pages* pages() const { return _pages; }

  // A line for the reader under the title of every screen; empty: none.
  QString notice() const { return _notice; }
  void setNotice(const QString& notice);

  // What the reader does not get to see, at the foot of the first screen; empty: all is shown.
  QString loss() const { return _loss; }
  void setLoss(const QString& loss);
  // How it is with the modem, for the first screen; empty: nothing to say.
  QString condition() const { return _condition; }
  void setCondition(const QString& condition);

  Q_INVOKABLE void back();
  // Puts a page on the stack: "signals", "happenings" or "recordings". One that is on it already is
  // gone back to; any other name is passed over.
  Q_INVOKABLE void open(const QString& page);
  Q_INVOKABLE void settle();

 signals:
  void storyboardChanged();
  void depthChanged();
  void pagesChanged();
  void noticeChanged();
  void lossChanged();
  void conditionChanged();

 private:
  void follow(const TableModel* table, IndexPath indexPath);
  void drawAnew();
  void stackChanged();
  void show(const std::shared_ptr<ViewController>& controller);

  InterfaceDescription* _storyboard = nullptr;
  std::shared_ptr<RootNavigationController> _controller;
  struct Screen {
    QString kind;
    QString title;
    QString subtitle;  // the technology of a category; empty: none
    QString previousTitle;
    TableModel* table = nullptr;  // a child
  };
  std::vector<Screen> _screens;
  int _depth = 0;
  Pages* _pages = nullptr;  // a child
  QString _notice;
  QString _loss;
  QString _condition;
};

}  // namespace qel
