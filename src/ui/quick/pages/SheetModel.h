// What is known of one field, as the sheet from below shows it.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <functional>
#include <optional>

#include "ui/pages/FieldSheet.h"
#include "ui/quick/pages/RowsModel.h"

namespace qel {

// GUI thread only. Open from a tap on a row until it is closed or the field is there no more. It
// shows what the row shows: it is read when it is opened and when its table was drawn anew; between
// that only its age goes on.
class SheetModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(bool opened READ isOpen NOTIFY changed)
  Q_PROPERTY(QString label READ label NOTIFY changed)
  Q_PROPERTY(QString key READ key NOTIFY changed)
  Q_PROPERTY(QString place READ place NOTIFY changed)
  Q_PROPERTY(QString value READ value NOTIFY changed)
  Q_PROPERTY(QString unit READ unit NOTIFY changed)
  Q_PROPERTY(QString word READ word NOTIFY changed)
  Q_PROPERTY(bool hasCurve READ hasCurve NOTIFY changed)
  Q_PROPERTY(QString curveText READ curveText NOTIFY changed)
  Q_PROPERTY(qel::RowsModel* lines READ lines CONSTANT)

 public:
  using QObject::QObject;

  // Which row of which table; a field is followed by its name when rows come and go.
  struct Place {
    std::string technology;
    std::string category;
    int section = 0;
    int row = 0;
    std::string field;
  };

  // Called when another field is to be shown.
  void setAsk(std::function<void()> ask) { _ask = std::move(ask); }
  void open(Place place);
  Q_INVOKABLE void close();
  Q_INVOKABLE void copy() const;

  // The rows below were drawn: the next refresh reads the field again.
  void tableDrawn() { _isToRead = true; }
  // The sheet as of the viewpoint; when it will read differently by itself.
  std::optional<std::uint64_t> refresh(const Viewpoint& viewpoint);

  bool isOpen() const { return _sheet.has_value(); }
  bool isWanted() const { return _place.has_value(); }
  const std::optional<FieldSheet>& sheet() const { return _sheet; }
  QString label() const { return text(&FieldSheet::label); }
  QString key() const { return text(&FieldSheet::key); }
  QString place() const { return text(&FieldSheet::place); }
  QString value() const { return text(&FieldSheet::value); }
  QString unit() const { return text(&FieldSheet::unit); }
  QString word() const { return text(&FieldSheet::word); }
  bool hasCurve() const { return _sheet && !_sheet->curve.empty(); }
  // The curve for whoever does not see it.
  QString curveText() const;
  RowsModel* lines() { return &_lines; }  // label, value, prose

 signals:
  void changed();

 private:
  QString text(std::string FieldSheet::*member) const;
  void read(const Viewpoint& viewpoint);
  void takeLines();

  std::function<void()> _ask;
  std::optional<Place> _place;
  bool _isToRead = false;
  std::optional<FieldSheet> _sheet;
  RowsModel _lines;
};

}  // namespace qel
