// The navigation stack of the viewer; its start brings the connection into service.
#pragma once

#include <memory>
#include <string>

#include "connection/TeskWrapper.h"
#include "metrics/MetricValidator.h"
#include "ui/kit/NavigationController.h"

namespace qel {

// Once per load of its view: clears the application's metric configuration, installs the one among
// the resources, listens and asks for the SIM files. Commands wait for their answers.
class RootNavigationController final : public NavigationController {
 public:
  using NavigationController::NavigationController;

  std::string myAppID = "qelwatch";
  std::string metricFileName = "orb_test_lte";
  std::string metricFileType = "deviceconfig";
  // In this order: the dispatcher's creation makes the wrapper listen.
  std::shared_ptr<TeskWrapper> myTeskWrapper = TeskWrapper::sharedInstance();
  std::shared_ptr<MetricValidator> myMetricValidator = MetricValidator::shared();

  void viewDidLoad() override;

  // The same again, unless a configuration was installed already: for a service that was not there
  // when the view was loaded.
  void comeIntoService();

 private:
  void bringIntoService();

  bool _inService = false;
};

}  // namespace qel
