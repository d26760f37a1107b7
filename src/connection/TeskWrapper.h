// The one object through which the viewer talks to the baseband manager service.
#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>

#include "base/DispatchQueue.h"
#include "connection/TeskWrapperDelegate.h"
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

  // Whether the last command that was sent had no answer for want of a service.
  bool foundNoService() const { return _foundNoService; }

 private:
  TeskWrapper() = default;

  // Sends the request; its result is logged and judged.
  bool perform(std::string_view operation, std::string_view command, const tesk::Message& request);

  std::shared_ptr<tesk::client::Manager> _teskManager;
  std::shared_ptr<SerialQueue> _queue;
  bool _foundNoService = false;
  mutable std::mutex _delegateMutex;
  std::weak_ptr<TeskWrapperDelegate> _delegate;
};

}  // namespace qel
