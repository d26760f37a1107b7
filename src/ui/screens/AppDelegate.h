// What the application's main loop calls at the turning points of its life.
#pragma once

#include <memory>

namespace qel {

class Window;

// Nothing depends on any of these calls: the program starts itself through its first screen.
class AppDelegate {
 public:
  std::shared_ptr<Window> window;

  // Yes: the start may go on.
  bool didFinishLaunchingWithOptions() { return true; }
  void applicationWillResignActive() {}
  void applicationDidEnterBackground() {}
  void applicationWillEnterForeground() {}
  void applicationDidBecomeActive() {}
  void applicationWillTerminate() {}
};

}  // namespace qel
