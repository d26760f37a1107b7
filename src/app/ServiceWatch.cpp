#include "app/ServiceWatch.h"

#include <QtCore/QTime>

#include "base/DispatchQueue.h"

namespace qel {
namespace {

// The reason in the reader's words; "since" when there was a time with the service.
QString noticeFor(const std::string& why, bool since) {
  QString notice = QStringLiteral("Baseband manager not reachable");
  if (since) notice += QStringLiteral(" since ") + QTime::currentTime().toString(u"HH:mm");
  if (why.find("permission") != std::string::npos) {
    notice += QStringLiteral(": no permission. Members of the group baseband have it.");
  }
  return notice;
}

}  // namespace

tesk::bus::ReachabilityObserver ServiceWatch::observer() {
  return [weak = weak_from_this()](bool reachable, const std::string& why) {
    MainQueue::shared().async([weak, reachable, why] {
      if (const auto watch = weak.lock()) watch->change(reachable, why);
    });
  };
}

void ServiceWatch::showIn(Navigation& navigation) {
  _navigation = &navigation;
  show();
}

void ServiceWatch::change(bool reachable, const std::string& why) {
  _notice = reachable ? QString() : noticeFor(why, _wasReachable);
  _wasReachable = _wasReachable || reachable;
  _reachable = reachable;
  show();
}

void ServiceWatch::show() {
  if (!_navigation) return;
  _navigation->setNotice(_notice);
  if (_reachable) _navigation->controller().comeIntoService();
}

}  // namespace qel
