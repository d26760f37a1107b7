// A stack of screens, of which the last is seen.
#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "ui/kit/ViewController.h"

namespace qel {

// Main thread only. Holds its screens until they are popped.
class NavigationController : public ViewController {
 public:
  using Observer = std::function<void()>;

  NavigationController() = default;
  explicit NavigationController(std::shared_ptr<ViewController> rootViewController);

  const std::vector<std::shared_ptr<ViewController>>& viewControllers() const { return _stack; }
  std::shared_ptr<ViewController> topViewController() const;

  // Loads the view of the new screen.
  void pushViewController(std::shared_ptr<ViewController> viewController);
  // The root is never popped: then the answer is nothing.
  std::shared_ptr<ViewController> popViewController();

  // Called after every change of the stack; an empty function ends that.
  void setObserver(Observer observer) { _observer = std::move(observer); }

 private:
  void changed() const;

  std::vector<std::shared_ptr<ViewController>> _stack;
  Observer _observer;
};

}  // namespace qel
