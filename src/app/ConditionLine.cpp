#include "app/ConditionLine.h"

#include <algorithm>

#include "base/DispatchQueue.h"

namespace qel {
namespace {

constexpr qsizetype kLongestLine = 120;

// It may come from another program: short, on one line, and nothing that cannot be seen.
QString shown(const std::string& line) {
  QString text;
  for (const QChar c : QString::fromStdString(line.substr(0, 4 * kLongestLine))) {
    if (c.isPrint()) text += c;
  }
  return text.left(kLongestLine);
}

}  // namespace

std::function<void(const std::string& line)> ConditionLine::observer() {
  return [weak = weak_from_this()](const std::string& line) {
    MainQueue::shared().async([weak, line] {
      if (const auto self = weak.lock()) self->change(line);
    });
  };
}

void ConditionLine::showIn(Navigation& navigation) {
  _navigation = &navigation;
  navigation.setCondition(_line);
}

void ConditionLine::change(const std::string& line) {
  _line = shown(line);
  if (_navigation) _navigation->setCondition(_line);
}

}  // namespace qel
