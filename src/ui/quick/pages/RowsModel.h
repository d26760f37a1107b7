// The rows of a page as the list that its face shows.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QAbstractListModel>
#include <QtCore/QString>
#include <QtCore/QVariantMap>
#include <vector>

namespace qel {

// GUI thread only. Takes a page's rows whole and announces only those that came, went or changed,
// so that the view stays where its reader left it.
class RowsModel : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its page")
  Q_PROPERTY(int count READ count NOTIFY taken)

 public:
  struct Row {
    QString id;  // the same as long as the row is there
    QString section;
    QVariantMap content;  // what the face reads as `row`
  };
  enum Role { rowRole = Qt::UserRole + 1, sectionRole };

  using QAbstractListModel::QAbstractListModel;

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  int count() const { return static_cast<int>(_rows.size()); }
  void take(std::vector<Row> rows);
  // Empty: there is no such row.
  Q_INVOKABLE QString idAt(int row) const;

 signals:
  void taken();

 private:
  std::vector<Row> _rows;
};

}  // namespace qel
