#include "tools/watch/RecordingsView.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include "tools/watch/Rows.h"

namespace qel::watch {

RecordingsView::RecordingsView(Desk& desk)
    : _desk(desk), _page(RecordingsFolder(RecordingsFolder::usualPath())), _growing(recorded()) {
  _page.refresh(_growing);
}

// The file being recorded; empty: none.
std::string RecordingsView::recorded() const {
  return _desk.recorder ? _desk.recorder->fileName() : std::string();
}

// A little between two frames, so that keys are heard.
void RecordingsView::readOn() {
  constexpr std::chrono::milliseconds kAtOnce{50};
  const auto end = std::chrono::steady_clock::now() + kAtOnce;
  while (_hasMoreToRead && std::chrono::steady_clock::now() < end) _hasMoreToRead = _page.work();
}

Sheet RecordingsView::sheet(Size size) {
  if (std::exchange(_growing, recorded()) != recorded()) {
    _page.refresh(_growing);
    _hasMoreToRead = true;
  }
  readOn();
  Sheet sheet;
  sheet.title = "Recordings";
  sheet.keys = "up/down choose  Enter open  d delete  u undo";
  sheet.keys += _desk.recorder ? "  R record  Escape back  q quit" : "  Escape back  q quit";
  const auto& view = _page.view();
  sheet.side = view.totalText;
  const auto say = [&](const std::string& text, Style style) {
    for (std::string& line : wrapped(text, static_cast<std::size_t>(size.columns))) {
      sheet.rows.push_back(plainRow(std::move(line), style));
    }
  };
  say(view.emptyText, Style::plain);
  for (const RecordingRow& row : view.rows) {
    sheet.rows.push_back(
        {{{"  " + padded(row.title, 34), Style::plain},
          {padded(row.length, 10) + padded(row.size, 10) + row.cells, Style::muted},
          {row.fault.empty() ? "" : "  " + row.fault, Style::notice}},
         row.name});
  }
  if (_desk.recorder && _growing.empty()) {
    sheet.rows.emplace_back();
    say(_desk.recorder->view().hiddenText, Style::muted);
  }
  for (const std::string& text : {view.undoText, view.error, _desk.playback.view().error}) {
    if (!text.empty()) sheet.foot.push_back(plainRow(text, Style::notice));
  }
  return sheet;
}

std::unique_ptr<View> RecordingsView::open(const std::string& rowId) {
  const auto& rows = _page.view().rows;
  const auto found = std::ranges::find(rows, rowId, &RecordingRow::name);
  if (found != rows.end()) _desk.playback.open(found->path);
  return nullptr;
}

bool RecordingsView::take(const KeyPress& press) {
  if (press.character == 'd' && !chosen.empty()) {
    _page.remove(chosen);
    return true;
  }
  if (press.character != 'u') return false;
  _page.undo();
  _hasMoreToRead = true;  // of what is there again
  return true;
}

bool takeForPlayback(const KeyPress& press, Playback& playback) {
  using namespace std::chrono_literals;
  if (!playback.isOpen()) return false;
  switch (press.character) {
    case ' ':
      playback.view().isPlaying ? playback.pause() : playback.play();
      return true;
    case 'n':
      playback.toNextHappening();
      return true;
    case 'p':
      playback.toPreviousHappening();
      return true;
    case '<':
      playback.step(-10s);
      return true;
    case '>':
      playback.step(10s);
      return true;
    case 'f': {
      const auto& speeds = Playback::kSpeeds;
      const auto* next = std::ranges::upper_bound(speeds, playback.view().speed);
      playback.setSpeed(next == speeds.end() ? speeds.front() : *next);
      return true;
    }
    case 'c':
      playback.close();
      return true;
    default:
      return false;
  }
}

std::vector<Row> playbackFoot(const Playback& playback) {
  const PlaybackView& view = playback.view();
  std::vector<Row> rows;
  if (view.state == PlaybackView::State::opening) {
    rows.push_back(plainRow(view.progressText, Style::notice));
  } else if (view.state == PlaybackView::State::open) {
    const std::string state = view.isPlaying ? "plays at " + view.speedText : "stands";
    rows.push_back({{{view.title + ", " + view.positionText + ", " + state, Style::strong},
                     {"  " + view.momentText, Style::muted}},
                    ""});
    rows.push_back(plainRow(
        "Space play/pause  f speed  </> 10 s  n/p next/previous happening  c close", Style::muted));
  }
  for (const std::string& note : view.notes) rows.push_back(plainRow(note, Style::notice));
  return rows;
}

}  // namespace qel::watch
