// One screen's table as the list that its face shows.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QAbstractListModel>
#include <memory>
#include <vector>

#include "ui/kit/TableSnapshot.h"
#include "ui/kit/TableViewController.h"

namespace qel {

// GUI thread only. Draws the table at once and at every reload; only rows that came, went or
// changed are announced, so that the view stays where its reader left it.
class TableModel final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Navigation")
  Q_PROPERTY(QString title READ title CONSTANT)
  Q_PROPERTY(QString previousTitle READ previousTitle CONSTANT)
  Q_PROPERTY(QString cellIdentifier READ cellIdentifier NOTIFY drawn)
  Q_PROPERTY(int count READ count NOTIFY drawn)
  Q_PROPERTY(bool blank READ isBlank NOTIFY drawn)

 public:
  enum Role {
    sectionTitleRole = Qt::UserRole + 1,
    cellRole,
    textRole,
    detailRole,
    noticeRole,
    changesRole,
    tableRole,
  };

  TableModel(std::shared_ptr<TableViewController> controller, QString previousTitle,
             QObject* parent);
  ~TableModel() override;

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  QString title() const;
  QString previousTitle() const { return _previousTitle; }
  // The prototype that the rows are made from; the last one known while there are no rows.
  QString cellIdentifier() const { return _cellIdentifier; }
  int count() const { return static_cast<int>(_rows.size()); }
  // Is there no text at all in any row, and no section to show?
  bool isBlank() const;

  // The user chose this row. The cell of an empty section cannot be chosen.
  Q_INVOKABLE void choose(int row);

 signals:
  void drawn();
  void chosen(qel::IndexPath indexPath);

 private:
  struct Row {
    IndexPath indexPath;
    std::optional<std::string> sectionTitle;
    RowSnapshot cell;
    int changes = 0;  // of its detail text since it came
  };

  std::vector<Row> rowsOf(TableSnapshot snapshot) const;
  static bool isSame(const Row& a, const Row& b);

  void draw();
  void takeRows(const std::vector<Row>& rows);
  void takeDetails(std::vector<Row>& rows);

  std::shared_ptr<TableViewController> _controller;
  QString _previousTitle;
  QString _cellIdentifier;
  std::vector<Row> _rows;
};

}  // namespace qel
