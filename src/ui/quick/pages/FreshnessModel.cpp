#include "ui/quick/pages/FreshnessModel.h"

#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {

void FreshnessModel::take(Freshness freshness) {
  if (_freshness == freshness) return;
  _freshness = std::move(freshness);
  emit changed();
}

QString FreshnessModel::source() const { return shown(_freshness.source); }
QString FreshnessModel::bar() const { return shown(_freshness.bar); }
QString FreshnessModel::loss() const { return shown(_freshness.loss); }

QString FreshnessModel::state() const {
  QString state = shown(_freshness.state);
  return state.isEmpty() ? state : state.left(1).toUpper() + state.mid(1);
}

}  // namespace qel
