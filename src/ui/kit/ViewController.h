// What every screen is: a title, a view that is loaded once, and a say in where a tap leads.
#pragma once

#include <memory>
#include <string>
#include <utility>

#include "ui/kit/TableViewCell.h"

namespace qel {

class ViewController;

// The way from one screen to the next. The destination's type alone says what it is.
struct Segue {
  std::string identifier;
  std::shared_ptr<ViewController> destination;
};

// Main thread only. Always held by shared_ptr: timers and the stack share it.
class ViewController : public std::enable_shared_from_this<ViewController> {
 public:
  ViewController() = default;
  ViewController(const ViewController&) = delete;
  ViewController& operator=(const ViewController&) = delete;
  virtual ~ViewController() = default;

  const std::string& title() const { return _title; }
  void setTitle(std::string title) { _title = std::move(title); }

  // Makes the view and calls viewDidLoad, the first time only.
  void loadViewIfNeeded();
  bool isViewLoaded() const { return _isViewLoaded; }

  virtual void viewDidLoad() {}
  virtual void didReceiveMemoryWarning() {}
  virtual void prepareForSegue(const Segue& segue, const Sender* sender);

 protected:
  virtual void loadView() {}

 private:
  std::string _title;
  bool _isViewLoaded = false;
};

}  // namespace qel
