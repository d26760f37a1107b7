// The one object through which the viewer talks to the baseband manager service.
#pragma once

#include <cstdint>
#include <memory>
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

  std::shared_ptr<TeskWrapperDelegate> delegate() const { return _delegate.lock(); }
  void setDelegate(const std::shared_ptr<TeskWrapperDelegate>& delegate) { _delegate = delegate; }

  // Installs the configuration file for this application. True when the service answered 0.
  bool addQuixConfigForAppId(std::string_view appId, const std::string& protofFilePath);
  // Clears this application's configuration. True when the service answered 0.
  bool removeQuixConfigForAppid(std::string_view appId);
  // Asks for one metric, once. True when the service answered 0; the metric comes as an event.
  bool querySpecificMetric(std::string_view appId, std::int32_t triggerRef,
                           std::int32_t triggerType, std::int32_t triggerID, std::int32_t profileID,
                           std::int32_t metricID);

 private:
  TeskWrapper() = default;

  std::shared_ptr<tesk::client::Manager> _teskManager;
  std::shared_ptr<SerialQueue> _queue;
  std::weak_ptr<TeskWrapperDelegate> _delegate;
};

}  // namespace qel
