// event-path: how long an event takes from the service's source to the viewer's store, over a bus
// of its own, and how many events a second the way takes; beside it the same events as D-Bus
// signals that a client only receives. Prints table rows. Standard output of the viewer's core goes
// to a file that nobody reads.

#include <fcntl.h>
#include <sdbus-c++/sdbus-c++.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <csignal>
#include <cstdlib>
#include <memory>
#include <new>
#include <thread>
#include <vector>

#include "base/DescriptorSink.h"
#include "base/DispatchQueue.h"
#include "metrics/MetricValidator.h"
#include "programs/Figures.h"
#include "recording/RecordingReader.h"
#include "service/ServiceCore.h"
#include "service/bus/BusFront.h"
#include "support/PrivateBus.h"
#include "tesk/Constants.h"
#include "tesk/bus/BusConnector.h"
#include "ui/kit/ResourceBundle.h"
#include "ui/screens/RootNavigationController.h"

namespace qel::benchmarks {
namespace {

using BusBytes = std::vector<std::uint8_t>;  // as the bus library knows them

using namespace std::chrono_literals;

constexpr int kRuns = 5;
constexpr std::uint64_t kPacedEvents = 4000;
constexpr std::uint64_t kFloodEvents = 40000;
constexpr std::uint64_t kMostUnderWay = 256;
constexpr std::string_view kSentKey = "kKeySentNs";
constexpr auto kPace = 1ms;

// What both processes see.
struct Shared {
  std::atomic<std::uint64_t> wanted = 0;  // events to send, over all rounds
  std::atomic<bool> paced = true;         // else as fast as they are taken
  std::atomic<std::uint64_t> sent = 0;
  std::atomic<std::uint64_t> stored = 0;
  std::atomic<bool> ready = false;
};
static_assert(std::atomic<std::uint64_t>::is_always_lock_free);

std::int64_t nowNs() { return std::chrono::nanoseconds(Clock::now().time_since_epoch()).count(); }

std::vector<RecordedEvent> metricsOf(const std::string& recording) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(recording, RecordingReader::BadLines::fail, fault);
  std::vector<RecordedEvent> events;
  while (auto event = reader ? reader->next() : std::nullopt) {
    if (event->kind == RecordedKind::metric) events.push_back(std::move(*event));
  }
  return events;
}

// Calls `send` for each event that is wanted, when it is due.
template <class Send>
void sendWanted(Shared& shared, const std::vector<RecordedEvent>& events, const Send& send) {
  auto next = Clock::now();
  while (true) {
    const std::uint64_t number = shared.sent;
    if (number >= shared.wanted) {
      std::this_thread::sleep_for(1ms);
      next = Clock::now();
      continue;
    }
    if (shared.paced) {
      std::this_thread::sleep_until(next += kPace);
    } else {
      while (number - shared.stored >= kMostUnderWay) std::this_thread::yield();
    }
    Dictionary entries = events[number % events.size()].entries;
    entries.set(std::string(kSentKey), nowNs());
    ++shared.sent;
    send(std::move(entries));
  }
}

// The events of a recording, again and again.
class WantedSource final : public sources::EventSource {
 public:
  WantedSource(Shared& shared, std::vector<RecordedEvent> events)
      : _shared(shared), _events(std::move(events)) {}

  void start(std::weak_ptr<sources::EventReceiver> receiver,
             std::shared_ptr<sources::ListenerSignal>) override {
    std::thread([this, receiver = std::move(receiver)] {
      sendWanted(_shared, _events, [&receiver](Dictionary entries) {
        const auto core = receiver.lock();
        if (core) core->take({0, tesk::kEventMetric, std::move(entries)});
      });
    }).detach();
  }
  void stop() override {}
  sources::SourceAnswer query(std::uint32_t) override { return {}; }
  std::string description() const override { return "wanted events"; }

 private:
  Shared& _shared;
  const std::vector<RecordedEvent> _events;
};

// Runs in a process of its own until it is killed or its parent ends.
pid_t inChild(const auto& body) {
  const pid_t child = ::fork();
  if (child != 0) return child;
  ::prctl(PR_SET_PDEATHSIG, SIGKILL);
  try {
    body();
  } catch (const std::exception& error) {
    std::fprintf(stderr, "event-path: %s\n", error.what());
  }
  std::_Exit(EXIT_FAILURE);
}

void serve(Shared& shared, const std::string& address, std::vector<RecordedEvent> events) {
  const auto core =
      service::ServiceCore::create(std::make_unique<WantedSource>(shared, std::move(events)));
  const auto connection = tesk::bus::connectTo({address});
  service::BusFront front(*connection, core);
  shared.ready = true;
  while (true) front.waitAndProcess(-1);
}

constexpr const char* kSignalName = "bench.Events";
constexpr const char* kSignalPath = "/bench/Events";

void emitSignals(Shared& shared, const std::string& address, std::vector<RecordedEvent> events) {
  const auto connection = tesk::bus::connectTo({address});
  const auto object = sdbus::createObject(*connection, kSignalPath);
  object->registerSignal("Metric")
      .onInterface(kSignalName)
      .withParameters<std::int64_t, BusBytes>();
  object->finishRegistration();
  connection->requestName(kSignalName);
  connection->enterEventLoopAsync();
  shared.ready = true;
  sendWanted(shared, events, [&object](const Dictionary& entries) {
    const Bytes& payload = *entries.find(kRecordedPayloadKey)->asBytes();
    object->emitSignal("Metric")
        .onInterface(kSignalName)
        .withArguments(*entries.find(kSentKey)->asInt64(),
                       BusBytes(payload.begin(), payload.end()));
  });
}

struct Result {
  std::vector<double> p50, p99, perSecond;
};

// The rounds: paced ones, then floods. `waitFor` blocks until so many events have come.
Result measure(Shared& shared, std::vector<double>& delays, const auto& waitFor) {
  Result result;
  const auto round = [&](bool paced, std::uint64_t events) {
    delays.clear();
    shared.paced = paced;
    const auto begun = Clock::now();
    shared.wanted += events;
    waitFor(shared.wanted.load());
    return std::chrono::duration<double>(Clock::now() - begun).count();
  };
  round(true, 500);  // everything has been touched once
  for (int run = 0; run < kRuns; ++run) {
    round(true, kPacedEvents);
    result.p50.push_back(percentile(delays, 0.5));
    result.p99.push_back(percentile(delays, 0.99));
  }
  for (int run = 0; run < kRuns; ++run) {
    result.perSecond.push_back(static_cast<double>(kFloodEvents) / round(false, kFloodEvents));
  }
  return result;
}

double msSince(std::int64_t sentNs) { return static_cast<double>(nowNs() - sentNs) / 1e6; }

// The dispatcher, with a look at the clock once the store holds the event.
class TimingDelegate final : public TeskWrapperDelegate {
 public:
  TimingDelegate(Shared& shared, std::vector<double>& delays) : _shared(shared), _delays(delays) {}
  void metricsDidUpdate(const std::optional<Dictionary>& event) override {
    MetricValidator::shared()->metricsDidUpdate(event);
    const Value* sent = event ? event->find(kSentKey) : nullptr;
    if (!sent) return;
    _delays.push_back(msSince(*sent->asInt64()));
    ++_shared.stored;
  }
  void eventsDidUpdate(const std::optional<Dictionary>&) override {}

 private:
  Shared& _shared;
  std::vector<double>& _delays;
};

void waitUntilReady(const Shared& shared) {
  while (!shared.ready) std::this_thread::sleep_for(1ms);
}

Result overTheStream(Shared& shared, const std::string& address) {
  waitUntilReady(shared);
  tesk::setConnector(tesk::bus::makeBusConnector({address}));
  ResourceBundle::setMain(std::make_shared<DirectoryBundle>(QEL_RESOURCES));
  std::vector<double> delays;
  const auto delegate = std::make_shared<TimingDelegate>(shared, delays);
  RootNavigationController root;
  root.myTeskWrapper->setDelegate(delegate);
  while (!root.myTeskWrapper->removeQuixConfigForAppid("qelwatch")) {
    std::this_thread::sleep_for(10ms);
  }
  root.loadViewIfNeeded();
  return measure(shared, delays, [&shared](std::uint64_t count) {
    MainQueue::shared().runUntil([&] { return shared.stored >= count; }, 10min);
  });
}

Result overSignals(Shared& shared, const std::string& address) {
  waitUntilReady(shared);
  const auto connection = tesk::bus::connectTo({address});
  const auto proxy = sdbus::createProxy(*connection, kSignalName, kSignalPath);
  std::vector<double> delays;
  proxy->uponSignal("Metric")
      .onInterface(kSignalName)
      .call([&](const std::int64_t& sent, const BusBytes&) {
        delays.push_back(msSince(sent));
        ++shared.stored;
      });
  proxy->finishRegistration();
  connection->enterEventLoopAsync();
  return measure(shared, delays, [&shared](std::uint64_t count) {
    while (shared.stored < count) std::this_thread::sleep_for(1ms);
  });
}

Shared& newShared() {
  void* memory =
      ::mmap(nullptr, sizeof(Shared), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
  return *new (memory) Shared;
}

// In processes of their own, so that no thread of one is there in the other. The child writes the
// medians into shared memory.
struct Medians {
  double p50, p99, perSecond;
};

Medians run(const auto& sender, const auto& receiver, const std::string& recording) {
  testing::PrivateBus bus;
  Shared& shared = newShared();
  auto* medians = static_cast<Medians*>(
      ::mmap(nullptr, sizeof(Medians), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0));
  const pid_t sending = inChild([&] { sender(shared, bus.address(), metricsOf(recording)); });
  const pid_t receiving = inChild([&] {
    const int nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
    setStandardOutput(std::make_shared<DescriptorSink>(nowhere));
    const Result result = receiver(shared, bus.address());
    *medians = {median(result.p50), median(result.p99), median(result.perSecond)};
    std::_Exit(EXIT_SUCCESS);
  });
  int status = 0;
  ::waitpid(receiving, &status, 0);
  ::kill(sending, SIGKILL);
  ::waitpid(sending, nullptr, 0);
  if (status != EXIT_SUCCESS) throw std::runtime_error("the receiver failed");
  return *medians;
}

std::string delayText(const Medians& medians) {
  return text(medians.p99, "ms") + " (half below " + text(medians.p50, "ms") + ")";
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  if (argc != 2) return 64;
  const Medians stream = run(serve, overTheStream, argv[1]);
  const Medians signals = run(emitSignals, overSignals, argv[1]);
  printRow("event from the source to the store over the bus, 99 % at 1,000 events/s",
           delayText(stream), delayText(signals) + ": D-Bus signals, received only", "< 2 ms");
  printRow("most events/s before the queue grows", text(stream.perSecond, "events/s", 0),
           text(signals.perSecond, "events/s", 0) + ": D-Bus signals, received only", "");
}
