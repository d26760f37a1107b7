#include "ui/kit/NavigationController.h"

#include <utility>

namespace qel {

NavigationController::NavigationController(std::shared_ptr<ViewController> rootViewController) {
  _stack.push_back(std::move(rootViewController));
}

std::shared_ptr<ViewController> NavigationController::topViewController() const {
  return _stack.empty() ? nullptr : _stack.back();
}

void NavigationController::pushViewController(std::shared_ptr<ViewController> viewController) {
  viewController->loadViewIfNeeded();
  _stack.push_back(std::move(viewController));
  changed();
}

std::shared_ptr<ViewController> NavigationController::popViewController() {
  if (_stack.size() < 2) return nullptr;
  std::shared_ptr<ViewController> left = std::move(_stack.back());
  _stack.pop_back();
  changed();
  return left;
}

void NavigationController::changed() const {
  if (_observer) _observer();
}

}  // namespace qel
