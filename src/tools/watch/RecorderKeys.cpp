#include "tools/watch/RecorderKeys.h"

#include "tools/watch/Rows.h"

namespace qel::watch {

bool RecorderKeys::take(const KeyPress& press) {
  _isNews = false;
  if (!_control) return false;
  const bool isRecording = _control->view().isRecording;
  if (press.character == 'm' && isRecording) {
    _control->mark();
    return true;
  }
  if (press.character != 'R') return false;
  _isNews = true;
  isRecording ? _control->stop() : _control->start();
  return true;
}

std::vector<Row> RecorderKeys::foot(Size size) const {
  if (!_control) return {};
  const RecordingControlView& view = _control->view();
  std::vector<Row> rows;
  if (view.isRecording) {
    const std::string mark = view.markText.empty() ? "" : ", " + view.markText;
    rows.push_back(
        {{{"Recording " + view.text + mark, Style::strong}, {"  m mark  R stop", Style::muted}},
         ""});
  }
  if (!_isNews) return rows;
  const std::string& news = view.isRecording ? view.hiddenText : view.outcome;
  for (std::string& line : wrapped(news, static_cast<std::size_t>(size.columns))) {
    rows.push_back(plainRow(std::move(line), Style::notice));
  }
  return rows;
}

void RecorderKeys::runTimer(Clock::time_point now) {
  const auto pause = _control ? _control->untilNextTick() : std::nullopt;
  if (!pause) return _tickAt.reset();
  if (!_tickAt) _tickAt = now + *pause;
  if (now < *_tickAt) return;
  _tickAt = now + *pause;
  _control->tick();
}

}  // namespace qel::watch
