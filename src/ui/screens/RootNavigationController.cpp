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
  if (_start == Start::foundNoService) bringIntoService();
  _again = _start == Start::underWay;
}

// Its commands may let the event loop run while they wait.
void RootNavigationController::bringIntoService() {
  Start came = Start::foundNoService;
  do {
    _again = false;
    _start = Start::underWay;
    came = start();
  } while (came == Start::foundNoService && _again);
  _start = came;
}

RootNavigationController::Start RootNavigationController::start() {
  if (myTeskWrapper) myTeskWrapper->removeQuixConfigForAppid(myAppID);
  const auto path = ResourceBundle::main().pathForResource(metricFileName, metricFileType);
  if (!path) {
    standardOutput().write("Metric Log File path doesnt exist");
    return Start::made;
  }
  standardOutput().write("pushing metric file");
  if (!myTeskWrapper) fatalError("no connection to install the metric configuration with");
  if (!myTeskWrapper->addQuixConfigForAppId(myAppID, *path)) {
    return myTeskWrapper->foundNoService() ? Start::foundNoService : Start::made;
  }
  if (myMetricValidator->mySharedTeskInstance) myMetricValidator->mySharedTeskInstance->listen();
  standardOutput().write("Querying SIM files");
  if (myTeskWrapper) {
    myTeskWrapper->querySpecificMetric(kQueryAppID, kQueryTriggerRef, kQueryTriggerType,
                                       kSIMFilesTriggerID, kQueryProfileID, kQueryMetricID);
  }
  return Start::made;
}

}  // namespace qel
