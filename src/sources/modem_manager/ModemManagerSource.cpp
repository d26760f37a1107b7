#include "sources/modem_manager/ModemManagerSource.h"

#include <poll.h>

#include <algorithm>
#include <atomic>
#include <utility>

#include "base/Clock.h"
#include "base/PollTimeout.h"
#include "base/WakeUp.h"
#include "sources/MetricKeeper.h"
#include "sources/modem_manager/ModemCondition.h"
#include "sources/modem_manager/ModemReports.h"

namespace qel::sources {
namespace {

using namespace std::chrono_literals;
using Steady = std::chrono::steady_clock;

constexpr std::chrono::milliseconds kFirstPause = 250ms;
constexpr std::chrono::milliseconds kLongestPause = 5s;

}  // namespace

struct ModemManagerSource::Run {
  Run(ModemWish modemWish, bus::BusAddress busAddress, const ModemTiming& modemTiming)
      : wish(std::move(modemWish)),
        address(std::move(busAddress)),
        timing(modemTiming),
        keeper(keptModemReports(), modemTiming.period),
        slept(modemTiming.asleep()) {}

  void stop() {
    stopping = true;
    wakeUp.signal();
  }

  // Connects, lives with that connection until it is lost, pauses, and so on.
  void play() {
    auto pause = kFirstPause;
    while (!stopping) {
      try {
        ModemLink link(address, wish, timing, said);
        pause = kFirstPause;
        live(link);
      } catch (const sdbus::Error& error) {
        // A failed attempt costs some memory inside the bus library, so the pauses grow.
        if (stopping) break;
        said.say(address.name, "no message bus (" + error.getMessage() + "), trying again");
      }
      keeper.clear();
      report(noBusCondition());
      rest(pause);
      pause = std::min(pause * 2, kLongestPause);
    }
  }

  void live(ModemLink& link) {
    while (!stopping) {
      noticeListeners();
      noticeSleep(link);
      if (const auto condition = link.condition()) report(*condition);
      update(link.picture());
      if (stopping) break;
      link.waitAndProcess(wakeUp.descriptor(), keeper.due());
      wakeUp.clear();
    }
    link.finish();
  }

  void update(const std::optional<ModemPicture>& modem) {
    if (!modem) return keeper.clear();
    keeper.update(modemReportBuilder(*modem), systemClock().nowMs(), Steady::now(),
                  [this](const SourceEvent& event) { hand(event); });
  }

  // A new listener is told everything.
  void noticeListeners() {
    const std::uint64_t now = listeners->generation();
    if (std::exchange(generation, now) != now) keeper.sendAll();
  }

  // The modem may be anywhere by now.
  void noticeSleep(ModemLink& link) {
    constexpr auto kNap = 1s;
    const auto now = timing.asleep();
    if (now - std::exchange(slept, now) >= kNap) link.readAnew();
  }

  void hand(const SourceEvent& event) {
    if (stopping) return;
    // Held no longer than this: letting go may be the end of the receiver and of the source.
    if (const auto taker = receiver.lock()) {
      taker->take(event);
    } else {
      stopping = true;
    }
  }

  void report(const SourceCondition& condition) {
    if (stopping || condition == reported) return;
    reported = condition;
    if (const auto taker = receiver.lock()) taker->conditionChanged(condition);
  }

  // New listeners do not shorten it.
  void rest(std::chrono::milliseconds pause) {
    const auto end = Steady::now() + pause;
    while (!stopping && Steady::now() < end) {
      pollfd waited{wakeUp.descriptor(), POLLIN, 0};
      ::poll(&waited, 1, pollTimeout(end));
      wakeUp.clear();
    }
  }

  const ModemWish wish;
  const bus::BusAddress address;
  const ModemTiming timing;
  std::weak_ptr<EventReceiver> receiver;
  std::shared_ptr<ListenerSignal> listeners;
  const WakeUp wakeUp;  // for the end and for new listeners
  std::atomic<bool> stopping = false;
  MetricKeeper keeper;
  // The thread only.
  SaidOnce said;
  std::uint64_t generation = 0;
  std::chrono::milliseconds slept;
  SourceCondition reported;
};

ModemManagerSource::ModemManagerSource(ModemWish wish, bus::BusAddress address, ModemTiming timing)
    : _wish(std::move(wish)), _address(std::move(address)), _timing(timing) {}

ModemManagerSource::~ModemManagerSource() { stop(); }

void ModemManagerSource::start(std::weak_ptr<EventReceiver> receiver,
                               std::shared_ptr<ListenerSignal> listeners) {
  stop();
  auto run = std::make_shared<Run>(_wish, _address, _timing);
  run->receiver = std::move(receiver);
  run->listeners = std::move(listeners);
  run->generation = run->listeners->generation();
  run->listeners->wake(std::shared_ptr<const WakeUp>(run, &run->wakeUp));
  const std::lock_guard lock(_mutex);
  _run = run;
  _threads.start([run] { run->play(); });
}

void ModemManagerSource::stop() {
  const std::lock_guard lock(_mutex);
  if (_run) _run->stop();
  _run.reset();
}

SourceAnswer ModemManagerSource::query(std::uint32_t metric) {
  std::shared_ptr<Run> run;
  {
    const std::lock_guard lock(_mutex);
    run = _run;
  }
  if (!run) return {false, "the source is not running", 0, {}};
  return run->keeper.query(metric);
}

std::string ModemManagerSource::description() const {
  if (!_wish.imei.empty()) return "modem " + _wish.imei + " of ModemManager";
  if (!_wish.path.empty()) return "modem " + _wish.path + " of ModemManager";
  return "first modem of ModemManager";
}

}  // namespace qel::sources
