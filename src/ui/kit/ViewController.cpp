#include "ui/kit/ViewController.h"

namespace qel {

void ViewController::loadViewIfNeeded() {
  if (std::exchange(_isViewLoaded, true)) return;
  loadView();
  viewDidLoad();
}

void ViewController::prepareForSegue(const Segue& /*segue*/, const Sender* /*sender*/) {}

}  // namespace qel
