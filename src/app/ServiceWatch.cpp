#include "app/ServiceWatch.h"

#include <QtCore/QMetaObject>
#include <QtCore/QTime>
#include <algorithm>
#include <array>
#include <string_view>

#include "base/DispatchQueue.h"
#include "tesk/bus/Reasons.h"

namespace qel {
namespace {

using tesk::bus::kBusy;
using tesk::bus::kNoAnswer;
using tesk::bus::kNoBus;
using tesk::bus::kNoPermission;
using tesk::bus::kRefused;
using tesk::bus::kTooManyClients;

// A reason in the reader's words, before and after the time since when.
struct Words {
  std::string_view reason;
  const char* what;
  const char* more;
};

constexpr std::array kWords = {
    Words{kNoPermission, "not reachable",
          ": no permission. Members of the group baseband have it."},
    Words{kTooManyClients, "has too many clients", ": waiting for a place."},
    Words{kNoAnswer, "does not answer", ""},
    Words{kBusy, "is busy", ""},
    Words{kRefused, "refuses this viewer", ""},
    Words{kNoBus, "not reachable", ": there is no message bus."},
};

QString noticeFor(const std::string& why, const QString& since) {
  const auto* found = std::ranges::find(kWords, why, &Words::reason);
  const bool isKnown = found != kWords.end();
  QString notice = QStringLiteral("Baseband manager ");
  notice += QLatin1StringView(isKnown ? found->what : "not reachable");
  if (!since.isEmpty()) notice += QStringLiteral(" since ") + since;
  if (isKnown) notice += QLatin1StringView(found->more);
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
  if (_reachable && !reachable) _since = QTime::currentTime().toString(u"HH:mm");
  _reachable = reachable;
  _notice = reachable ? QString() : noticeFor(why, _since);
  show();
}

void ServiceWatch::show() {
  if (!_navigation) return;
  _navigation->setNotice(_notice);
  if (!_reachable) return;
  Navigation* navigation = _navigation;
  QMetaObject::invokeMethod(
      navigation, [navigation] { navigation->controller().comeIntoService(); },
      Qt::QueuedConnection);
}

}  // namespace qel
