// Tells the reader how it is with the modem.
#pragma once

#include <QtCore/QPointer>
#include <QtCore/QString>
#include <functional>
#include <memory>
#include <string>

#include "ui/quick/Navigation.h"

namespace qel {

// Main thread, but for the observer. The line stands on the first screen and follows each change.
class ConditionLine final : public std::enable_shared_from_this<ConditionLine> {
 public:
  // Takes the line, from any thread; empty: there is nothing to say. It may outlive this.
  std::function<void(const std::string& line)> observer();

  // From now on the window shows what is known.
  void showIn(Navigation& navigation);

 private:
  void change(const std::string& line);

  QPointer<Navigation> _navigation;
  QString _line;
};

}  // namespace qel
