// The one object through which the viewer talks to the baseband manager service.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "base/DispatchQueue.h"
#include "connection/TeskWrapperDelegate.h"
#include "tesk/EventBacklog.h"
#include "tesk/Manager.h"

namespace qel {

// Main thread; its event handlers run on its serial queue and hand over to the main queue. Nothing
// here throws: commands answer yes or no and log code and message.
class TeskWrapper final : public std::enable_shared_from_this<TeskWrapper> {
 public:
  // The one of the process, made on first use. No lock: first reached on the main thread.
  static const std::shared_ptr<TeskWrapper>& sharedInstance();

  // Connects to the service as "qelwatch". Subscribes to nothing yet.
  static std::shared_ptr<TeskWrapper> init();

  // The serial queue on which events arrive. Made once a process, for the first object that asks:
  // any other object has none.
  const std::shared_ptr<SerialQueue>& queue();

  // Subscribes to trigger and metric events and starts their delivery anew.
  void listen();

  // Held weakly. May be replaced while events arrive: the queue reads it too.
  std::shared_ptr<TeskWrapperDelegate> delegate() const;
  void setDelegate(const std::shared_ptr<TeskWrapperDelegate>& delegate);

  // Installs the configuration file for this application. True when the service answered 0.
  bool addQuixConfigForAppId(std::string_view appId, const std::string& protofFilePath);
  // Clears this application's configuration. True when the service answered 0.
  bool removeQuixConfigForAppid(std::string_view appId);
  // Asks for one metric, once. True when the service answered 0; the metric comes as an event.
  bool querySpecificMetric(std::string_view appId, std::int32_t triggerRef,
                           std::int32_t triggerType, std::int32_t triggerID, std::int32_t profileID,
                           std::int32_t metricID);

  // Events that came faster than they were taken and were dropped, so far. The observer is told on
  // the main queue, once a second at most while events wait and whenever none waits any more. The
  // system log has a line every ten seconds at most.
  using LossObserver = std::function<void(std::uint64_t dropped)>;
  std::uint64_t droppedEvents() const;
  void setLossObserver(LossObserver observer) { _lossObserver = std::move(observer); }

  // Whether the last command that was sent had no answer for want of a service.
  bool foundNoService() const { return _foundNoService; }

 private:
  TeskWrapper() = default;

  // On the queue, then on the main queue.
  void handOver(const tesk::Message& event, std::string_view eventName, std::string_view logText);
  void deliverOne();
  void tellLoss();

  // Sends the request; its result is logged and judged.
  bool perform(std::string_view operation, std::string_view command, const tesk::Message& request);

  std::shared_ptr<tesk::client::Manager> _teskManager;
  std::shared_ptr<SerialQueue> _queue;
  bool _foundNoService = false;
  mutable std::mutex _delegateMutex;
  std::weak_ptr<TeskWrapperDelegate> _delegate;
  tesk::EventBacklog _backlog;  // before the main queue

  LossObserver _lossObserver;
  std::uint64_t _lossTold = 0;
  std::optional<std::chrono::steady_clock::time_point> _lossToldAt;
  std::optional<std::chrono::steady_clock::time_point> _lossLoggedAt;
};

}  // namespace qel
