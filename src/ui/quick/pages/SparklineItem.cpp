#include "ui/quick/pages/SparklineItem.h"

namespace qel {

std::optional<SmallCurveItem::Drawn> SparklineItem::curve() const {
  if (!_page) return std::nullopt;
  const NowPage& page = _page->page();
  return Drawn{page.runs, page.runsFromMs, page.runsToMs, page.lowest, page.highest};
}

}  // namespace qel
