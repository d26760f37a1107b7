#include "ui/pages/RecordingsPage.h"

#include <algorithm>
#include <utility>

#include "base/Amounts.h"
#include "base/TimeZone.h"
#include "history/recorded/RecordingDigest.h"
#include "recording/RecordingReader.h"

namespace qel {
namespace {

constexpr std::size_t kEventsAtOnce = 2048;

std::string titleOf(std::uint64_t beginMs) {
  return dateText(static_cast<double>(beginMs), systemTimeZone());
}

}  // namespace

// A file as it was when it was looked at last.
struct RecordingsPage::Known {
  RecordingFile file;
  bool isTitled = false;
  bool isDigested = false;
  std::string title;
  std::string length;
  std::string cells;
  std::string fault;
};

// Some may be of a viewer that was ended before it could; those of a day may be of one that runs.
RecordingsPage::RecordingsPage(RecordingsFolder folder, const Clock& clock)
    : _folder(std::move(folder)) {
  constexpr std::uint64_t kDayMs = 24ULL * 60 * 60 * 1000;
  _folder.dropHiddenBefore(clock.nowMs() - std::min(clock.nowMs(), kDayMs));
}

RecordingsPage::~RecordingsPage() {
  if (_removed) _folder.dropHidden(*_removed);
}

void RecordingsPage::changed() {
  describe();
  if (_onChanged) _onChanged();
}

void RecordingsPage::refresh(const std::string& growing) {
  _growing = growing;
  std::map<std::string, Known> known;
  for (RecordingFile& file : _folder.files()) {
    const auto before = _known.find(file.name);
    const bool isSame = before != _known.end() && before->second.file.bytes == file.bytes &&
                        before->second.file.changedMs == file.changedMs;
    Known& now = known[file.name];
    if (isSame) now = std::move(before->second);
    if (!isSame && file.name == _digested) _digest.reset();  // begun with what was there before
    now.file = std::move(file);
  }
  _known = std::move(known);
  if (!_known.contains(_digested)) _digest.reset();
  changed();
}

// Of one of those that have none, so that no title waits for what is in a large file.
void RecordingsPage::takeTitle() {
  for (auto known = _known.rbegin(); known != _known.rend(); ++known) {
    auto& [name, about] = *known;
    if (about.isTitled || about.isDigested || name == _growing) continue;
    about.isTitled = true;
    RecordingFault fault;
    const auto reader =
        RecordingReader::open(_folder.pathOf(name), RecordingReader::BadLines::fail, fault);
    const auto first = reader ? reader->next() : std::nullopt;
    if (first) about.title = titleOf(first->timeMs);
    changed();
    return;
  }
}

bool RecordingsPage::beginDigest() {
  for (auto known = _known.rbegin(); known != _known.rend(); ++known) {
    if (known->second.isDigested || known->first == _growing) continue;
    RecordingFault fault;
    _digested = known->first;
    _digest = RecordingDigest::open(_folder.pathOf(_digested), fault);
    if (_digest) return true;
    known->second.isDigested = true;
    known->second.fault = fault.message;
    changed();
  }
  return false;
}

bool RecordingsPage::work() {
  takeTitle();
  if (!_digest && !beginDigest()) return false;
  if (_digest->readOn(kEventsAtOnce)) return true;
  Known& known = _known.at(_digested);
  known.isDigested = true;
  known.fault = _digest->fault();
  if (_digest->events() == 0 && known.fault.empty()) known.fault = "No event in it";
  if (_digest->events() > 0) {
    known.title = titleOf(_digest->beginMs());
    known.length = durationText(std::chrono::seconds(_digest->lengthMs() / 1000));
    known.cells = counted(_digest->cells(), "cell");
  }
  _digest.reset();
  changed();
  return true;
}

void RecordingsPage::remove(const std::string& name) {
  if (!_known.contains(name) || name == _growing) return;
  forget();
  _view.error = _folder.hide(name);
  if (_view.error.empty()) _removed = name;
  refresh(_growing);
}

void RecordingsPage::undo() {
  if (!_removed) return;
  _view.error = _folder.restore(*_removed);
  _removed.reset();
  refresh(_growing);
}

void RecordingsPage::forget() {
  if (!_removed) return;
  _folder.dropHidden(*_removed);
  _removed.reset();
  changed();
}

void RecordingsPage::describe() {
  _view.rows.clear();
  std::uint64_t bytes = 0;
  for (auto known = _known.rbegin(); known != _known.rend(); ++known) {
    const auto& [name, about] = *known;
    bytes += about.file.bytes;
    RecordingRow row;
    row.name = name;
    row.path = _folder.pathOf(name);
    row.isGrowing = name == _growing;
    row.title = about.title.empty() ? name : about.title;
    row.length = about.length;
    row.size = sizeText(about.file.bytes);
    row.cells = row.isGrowing ? "being recorded" : about.cells;
    row.fault = about.fault;
    _view.rows.push_back(std::move(row));
  }
  _view.emptyText = _known.empty() ? "Nothing has been recorded yet" : "";
  _view.totalText = counted(_known.size(), "recording") + ", " + sizeText(bytes) + " of " +
                    sizeText(_folder.limits().bytes);
  _view.undoText = _removed ? *_removed + " deleted" : "";
}

}  // namespace qel
