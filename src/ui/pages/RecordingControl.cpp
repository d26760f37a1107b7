#include "ui/pages/RecordingControl.h"

#include <algorithm>
#include <utility>

#include "base/Amounts.h"

namespace qel {
namespace {

using namespace std::chrono_literals;
using capture::RecordConnection;
using capture::Recorder;

constexpr auto kPause = 1s;

constexpr const char* kHidden =
    "Hidden: subscriber and temporary identities, SIM files and addresses. Cells, areas, networks "
    "and times stay: a recording tells where the phone was, and when.";

}  // namespace

// The service is waited for as long as this lives.
class RecordingControl::Talk {
 public:
  explicit Talk(RecordingControl& control) : _control(control) { _control._isTalking = true; }
  ~Talk() { _control._isTalking = false; }
  Talk(const Talk&) = delete;
  Talk& operator=(const Talk&) = delete;

 private:
  RecordingControl& _control;
};

RecordingControl::RecordingControl(RecordingsFolder folder, Way way, const Clock& clock, Now now,
                                   Recorder::Asleep asleep)
    : _folder(std::move(folder)),
      _way(std::move(way)),
      _clock(clock),
      _now(std::move(now)),
      _asleep(std::move(asleep)) {
  _view.hiddenText = kHidden;
}

RecordingControl::~RecordingControl() {
  _onChanged = nullptr;
  stop();
}

void RecordingControl::changed() {
  describe();
  if (_onChanged) _onChanged();
}

void RecordingControl::start() {
  if (_recorder || _isTalking) return;
  _view.outcome.clear();
  _isToStop = false;
  if (begin() && _isToStop) finish("");
  changed();
}

bool RecordingControl::begin() {
  const auto name = _folder.nameForNew(_clock.nowMs(), _view.outcome);
  if (!name) return false;
  RecordingLimits limits;
  _room = _folder.limits().bytes - std::min(_folder.limits().bytes, _folder.bytes());
  auto recording = RotatingRecording::create(
      _folder.pathOf(*name), limits, RotatingRecording::Existing::refused, _now(), _view.outcome);
  if (!recording) return false;
  auto hider = std::make_unique<IdentityHider>(Pseudonyms::random());
  _recorder = std::make_unique<Recorder>(std::move(recording), std::move(hider), _clock, _asleep);
  _connection = std::make_unique<RecordConnection>(
      *_way.connector, capture::kViewersRecorder, _way.bus, _way.configuration,
      [recorder = _recorder.get()](std::string_view eventName, const tesk::Message& event) {
        recorder->take(eventName, event);
      });
  _fileName = *name;
  _begun = _now();
  return connect();
}

bool RecordingControl::connect() {
  changed();
  tesk::CommandResult begun;
  {
    const Talk talk(*this);
    begun = _connection->begin();
  }
  if (begun.code == 0) return true;
  finish("Nothing can be recorded: " + begun.message);
  return false;
}

void RecordingControl::mark() {
  if (!_recorder || _isTalking) return;
  if (!_recorder->mark()) finish(_recorder->error());
  changed();
}

void RecordingControl::stop() {
  _isToStop = true;
  if (!_recorder || _isTalking) return;
  finish("");
  changed();
}

// Without a reason it ends because somebody wanted it to. What holds nothing is not kept.
void RecordingControl::finish(const std::string& why) {
  std::uint64_t lost = 0;
  {
    const Talk talk(*this);
    lost = _connection->end();
  }
  _connection.reset();
  const bool isWhole = _recorder->close();
  const Recorder::Progress progress = _recorder->progress();
  std::string outcome = why.empty() ? "" : why + ". ";
  if (!isWhole && why.empty()) outcome = _recorder->error() + ". ";
  if (progress.events == 0) {
    outcome += "Nothing was recorded";
    _folder.drop(_fileName);
  } else {
    outcome += "Kept as " + _fileName + ": " + counted(progress.events, "event");
    if (lost > 0) outcome += ", " + counted(lost, "more event") + " came too fast to be recorded";
  }
  _view.outcome = outcome;
  _recorder.reset();
  _fileName.clear();
}

void RecordingControl::serviceCameBack() {
  if (!_connection || _isTalking) return;
  _isToStop = false;
  tesk::CommandResult begun;
  {
    const Talk talk(*this);
    begun = _connection->begin();
  }
  if (begun.code != 0) {
    finish("Nothing more can be recorded: " + begun.message);
    changed();
  } else if (_isToStop) {
    stop();
  }
}

std::optional<std::chrono::milliseconds> RecordingControl::untilNextTick() const {
  if (!_recorder) return std::nullopt;
  return kPause;
}

void RecordingControl::tick() {
  if (!_recorder || _isTalking) return;
  if (!_recorder->tend()) {
    finish(_recorder->error());
  } else if (_recorder->progress().bytes >= _room) {
    finish("Recordings take up the " + sizeText(_folder.limits().bytes) + " that they may");
  }
  changed();
}

void RecordingControl::describe() {
  _view.isRecording = _recorder != nullptr;
  _view.text.clear();
  _view.markText.clear();
  if (!_recorder) return;
  const Recorder::Progress progress = _recorder->progress();
  _view.text = durationText(std::chrono::floor<std::chrono::seconds>(_now() - _begun)) + ", " +
               counted(progress.events, "event") + ", " + sizeText(progress.bytes);
  if (progress.marks > 0) _view.markText = "Mark " + std::to_string(progress.marks);
}

}  // namespace qel
