// The last ten minutes of a field, drawn small.
#pragma once

#include "ui/quick/pages/SheetModel.h"
#include "ui/quick/pages/SmallCurveItem.h"

namespace qel {

// GUI thread.
// The tools of QML look for the base by its whole name.
class SheetCurveItem : public qel::SmallCurveItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(SheetCurve)
  Q_PROPERTY(qel::SheetModel* sheet READ page WRITE setPage NOTIFY pageChanged)

 public:
  using SmallCurveItem::SmallCurveItem;

  SheetModel* page() const { return _page; }
  void setPage(SheetModel* page) { follow(_page, page, &SheetModel::changed); }

 protected:
  std::optional<Drawn> curve() const override;

 private:
  QPointer<SheetModel> _page;
};

}  // namespace qel
