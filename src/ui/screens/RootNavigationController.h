// The navigation stack of the viewer; its start brings the connection into service.
#pragma once

#include <cstdint>
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

  // The same again when it found no service. A refused installation is not made again, nor one
  // without a file.
  void comeIntoService();

 private:
  enum class Start : std::uint8_t { notMade, underWay, made, foundNoService };

  void bringIntoService();
  Start start();

  Start _start = Start::notMade;
  bool _again = false;  // the service came while the start was under way
};

}  // namespace qel
