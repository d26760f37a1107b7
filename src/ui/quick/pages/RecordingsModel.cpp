#include "ui/quick/pages/RecordingsModel.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

QVariantMap contentOf(const RecordingRow& row) {
  return {{"name", shown(row.name)}, {"title", shown(row.title)}, {"length", shown(row.length)},
          {"size", shown(row.size)}, {"cells", shown(row.cells)}, {"fault", shown(row.fault)},
          {"growing", row.isGrowing}};
}

}  // namespace

RecordingsModel::RecordingsModel(QObject* parent)
    : QObject(parent), _page(RecordingsFolder(RecordingsFolder::usualPath())) {
  _work.setSingleShot(true);
  connect(&_work, &QTimer::timeout, this, &RecordingsModel::work);
  _page.setOnChanged([this] { take(); });
}

QString RecordingsModel::emptyText() const { return shown(_page.view().emptyText); }
QString RecordingsModel::totalText() const { return shown(_page.view().totalText); }
QString RecordingsModel::undoText() const { return shown(_page.view().undoText); }
QString RecordingsModel::error() const { return shown(_page.view().error); }

void RecordingsModel::enter(const std::string& growing) {
  _page.refresh(growing);
  take();
  _work.start(std::chrono::milliseconds(0));
}

void RecordingsModel::leave() {
  _work.stop();
  _page.forget();
}

std::string RecordingsModel::pathOf(const QString& name) const {
  const auto& rows = _page.view().rows;
  const auto found = std::ranges::find(rows, name.toStdString(), &RecordingRow::name);
  return found == rows.end() ? std::string() : found->path;
}

void RecordingsModel::remove(const QString& name) { _page.remove(name.toStdString()); }

void RecordingsModel::undo() {
  _page.undo();
  _work.start(std::chrono::milliseconds(0));  // of what is there again
}

void RecordingsModel::work() {
  if (_page.work()) _work.start(std::chrono::milliseconds(0));
}

void RecordingsModel::take() {
  std::vector<RowsModel::Row> rows;
  for (const RecordingRow& row : _page.view().rows) {
    rows.push_back({shown(row.name), {}, contentOf(row)});
  }
  _rows.take(std::move(rows));
  emit changed();
}

}  // namespace qel
