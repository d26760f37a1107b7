#include "ui/screens/RootNavigationController.h"

#include <cstdint>

#include "base/FatalError.h"
#include "base/LogSink.h"
#include "ui/kit/ResourceBundle.h"

namespace qel {
namespace {

// One query for the SIM files.
constexpr const char* kQueryAppID = "qelwatch";
constexpr std::int32_t kQueryTriggerRef = 9999;
constexpr std::int32_t kQueryTriggerType = 0;
constexpr std::int32_t kSIMFilesTriggerID = 0x7F0013;
constexpr std::int32_t kQueryProfileID = 0;
constexpr std::int32_t kQueryMetricID = 0;

}  // namespace

void RootNavigationController::viewDidLoad() {
  NavigationController::viewDidLoad();
  bringIntoService();
}

void RootNavigationController::comeIntoService() {
  if (!_inService) bringIntoService();
}

void RootNavigationController::bringIntoService() {
  if (myTeskWrapper) myTeskWrapper->removeQuixConfigForAppid(myAppID);
  const auto path = ResourceBundle::main().pathForResource(metricFileName, metricFileType);
  if (!path) {
    standardOutput().write("Metric Log File path doesnt exist");
    return;
  }
  standardOutput().write("pushing metric file");
  if (!myTeskWrapper) fatalError("no connection to install the metric configuration with");
  if (!myTeskWrapper->addQuixConfigForAppId(myAppID, *path)) return;
  _inService = true;
  if (myMetricValidator->mySharedTeskInstance) myMetricValidator->mySharedTeskInstance->listen();
  standardOutput().write("Querying SIM files");
  if (!myTeskWrapper) return;
  myTeskWrapper->querySpecificMetric(kQueryAppID, kQueryTriggerRef, kQueryTriggerType,
                                     kSIMFilesTriggerID, kQueryProfileID, kQueryMetricID);
}

}  // namespace qel
