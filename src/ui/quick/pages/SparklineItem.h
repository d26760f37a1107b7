// The last two minutes of the level, drawn small.
#pragma once

#include "ui/quick/pages/NowModel.h"
#include "ui/quick/pages/SmallCurveItem.h"

namespace qel {

// GUI thread.
// The tools of QML look for the base by its whole name.
class SparklineItem : public qel::SmallCurveItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(Sparkline)
  Q_PROPERTY(qel::NowModel* page READ page WRITE setPage NOTIFY pageChanged)

 public:
  using SmallCurveItem::SmallCurveItem;

  NowModel* page() const { return _page; }
  void setPage(NowModel* page) { follow(_page, page, &NowModel::runsChanged); }

 protected:
  std::optional<Drawn> curve() const override;

 private:
  QPointer<NowModel> _page;
};

}  // namespace qel
