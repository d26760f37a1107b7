#include "connection/TeskWrapper.h"

#include <algorithm>
#include <array>
#include <mutex>
#include <utility>

#include "base/FileContent.h"
#include "base/LogSink.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

constexpr std::string_view kClientName = "qelwatch";
constexpr std::string_view kQueueLabel = "tesk.qelwatch.serialQ.queue";
constexpr std::string_view kHandler = "-[TeskWrapper listen]_block_invoke";
constexpr std::chrono::seconds kLossPause{1};
constexpr std::chrono::seconds kLossLogPause{10};
constexpr std::int64_t kAppID = 2;
constexpr std::int64_t kPayloadType = 0;
constexpr std::size_t kLargestConfiguration = 1024 * 1024;  // bytes; a larger file reads as empty

// An event stream of the manager and where its events go.
struct Stream {
  std::string_view eventName;
  std::string_view logText;
  void (TeskWrapperDelegate::*deliver)(const std::optional<Dictionary>&);
};

constexpr std::array kStreams = {
    Stream{tesk::kEventTrigger, "-[TeskWrapper listen]_block_invoke: EventTrigger dict=",
           &TeskWrapperDelegate::eventsDidUpdate},
    Stream{tesk::kEventMetric, "-[TeskWrapper listen]_block_invoke: MetricsTrigger dict=",
           &TeskWrapperDelegate::metricsDidUpdate},
};

void logOperation(std::string_view operation, std::string_view text) {
  std::string line(operation);
  line += ": ";
  line += text;
  systemLog().write(line);
}

}  // namespace

const std::shared_ptr<TeskWrapper>& TeskWrapper::sharedInstance() {
  static auto& instance = *new std::shared_ptr<TeskWrapper>;  // never released
  if (!instance) instance = init();
  return instance;
}

std::shared_ptr<TeskWrapper> TeskWrapper::init() {
  const std::shared_ptr<TeskWrapper> wrapper(new TeskWrapper);
  wrapper->_teskManager = tesk::client::CreateManager(kClientName, wrapper->queue());
  return wrapper;
}

const std::shared_ptr<SerialQueue>& TeskWrapper::queue() {
  static std::once_flag once;
  std::call_once(once,
                 [this] { _queue = std::make_shared<SerialQueue>(std::string(kQueueLabel)); });
  return _queue;
}

std::shared_ptr<TeskWrapperDelegate> TeskWrapper::delegate() const {
  const std::lock_guard lock(_delegateMutex);
  return _delegate.lock();
}

void TeskWrapper::setDelegate(const std::shared_ptr<TeskWrapperDelegate>& delegate) {
  const std::lock_guard lock(_delegateMutex);
  _delegate = delegate;
}

void TeskWrapper::handOver(const tesk::Message& event, std::string_view eventName,
                           std::string_view logText) {
  Dictionary dictionary = tesk::createDictionaryFromMessage(event);
  systemLog().writeEvent(logText, dictionary);
  if (!delegate()) return;
  if (!_backlog.add({std::string(eventName), std::move(dictionary)})) return;
  MainQueue::shared().async([wrapper = shared_from_this()] { wrapper->deliverOne(); });
}

void TeskWrapper::deliverOne() {
  if (auto event = _backlog.take()) {
    const auto* stream = std::ranges::find(kStreams, event->name, &Stream::eventName);
    const auto receiver = delegate();
    const std::optional<Dictionary> held = std::move(event->entries);
    if (receiver) ((*receiver).*stream->deliver)(held);
  }
  tellLoss();
}

std::uint64_t TeskWrapper::droppedEvents() const {
  return _backlog.dropped() + tesk::client::DroppedEvents(_teskManager);
}

void TeskWrapper::tellLoss() {
  const std::uint64_t dropped = droppedEvents();
  if (dropped == _lossTold) return;
  const auto now = std::chrono::steady_clock::now();
  if (_lossToldAt && now - *_lossToldAt < kLossPause && !_backlog.isEmpty()) return;
  _lossTold = dropped;
  _lossToldAt = now;
  if (_lossObserver) _lossObserver(dropped);
  if (_lossLoggedAt && now - *_lossLoggedAt < kLossLogPause) return;
  _lossLoggedAt = now;
  logOperation(kHandler, std::to_string(dropped) +
                             " events dropped so far, which came faster than they were taken");
}

void TeskWrapper::listen() {
  for (const Stream& stream : kStreams) {
    tesk::client::RegisterEventHandler(
        _teskManager, stream.eventName,
        [weak = weak_from_this(), &stream](const tesk::Message& event,
                                           tesk::client::DispatchGroup&) {
          if (const auto wrapper = weak.lock()) {
            wrapper->handOver(event, stream.eventName, stream.logText);
          }
        });
  }
  tesk::client::EventsOff(_teskManager);
  tesk::client::EventsOn(_teskManager);
  logOperation("-[TeskWrapper listen]", "listening for events");
}

bool TeskWrapper::perform(std::string_view operation, std::string_view command,
                          const tesk::Message& request) {
  tesk::CommandResult result{static_cast<std::int32_t>(0xE020E002), ""};
  tesk::Message reply;
  result = tesk::client::PerformCommand(_teskManager, command, request, reply);
  logOperation(operation, "error=" + std::to_string(result.code) + " msg=" + result.message);
  _foundNoService = result.code == tesk::kServiceUnreachable;
  return result.code == 0;
}

bool TeskWrapper::addQuixConfigForAppId(std::string_view appId, const std::string& protofFilePath) {
  if (appId != kClientName) return false;
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kAppID);
  request.setData(tesk::kKeyPayload, contentOfFile(protofFilePath, kLargestConfiguration));
  request.setInt64(tesk::kKeyPayloadType, kPayloadType);
  return perform("-[TeskWrapper addQuixConfigForAppId:andProtofFilePath:]",
                 tesk::kCommandAddConfiguration, request);
}

bool TeskWrapper::removeQuixConfigForAppid(std::string_view appId) {
  if (appId != kClientName) return false;
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kAppID);
  return perform("-[TeskWrapper removeQuixConfigForAppid:]", tesk::kCommandClearConfiguration,
                 request);
}

bool TeskWrapper::querySpecificMetric(std::string_view appId, std::int32_t triggerRef,
                                      std::int32_t triggerType, std::int32_t triggerID,
                                      std::int32_t profileID, std::int32_t metricID) {
  if (appId != kClientName) return false;
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kAppID);
  request.setInt64(tesk::kKeyPayloadType, kPayloadType);
  request.setInt64(tesk::kKeyTriggerRef, triggerRef);
  request.setInt64(tesk::kKeyTriggerType, triggerType);
  request.setInt64(tesk::kKeyTriggerID, triggerID);
  request.setInt64(tesk::kKeyProfileID, profileID);
  request.setInt64(tesk::kKeyMetricID, metricID);
  return perform(
      "-[TeskWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:"
      "metricID:]",
      tesk::kCommandQueryMetric, request);
}

}  // namespace qel
