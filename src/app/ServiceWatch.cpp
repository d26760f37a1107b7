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
using tesk::bus::kNotStarted;
using tesk::bus::kNotThere;
using tesk::bus::kRefused;
using tesk::bus::kTooManyClients;

// A reason in the reader's words, before and after the time since when, with what to do next.
struct Words {
  std::string_view reason;
  const char* what;
  const char* more;
};

constexpr std::array kWords = {
    Words{kNotStarted, "not running",
          ": it could not be started. Its log says why: journalctl -u basebandd"},
    Words{kNoPermission, "not reachable",
          ": no permission. Members of the group baseband have it: join it, then log in again."},
    Words{kTooManyClients, "has too many clients", ": waiting for a place."},
    Words{kNoAnswer, "does not answer", ""},
    Words{kBusy, "is busy", ""},
    Words{kRefused, "refuses this viewer", ""},
    Words{kNoBus, "not reachable", ": there is no message bus."},
};
// The package tells the system bus how to start it: unknown there means that it is not installed.
constexpr Words kNotInstalled{kNotThere, "not reachable",
                              ": it is not installed. Install the package basebandd."};
constexpr Words kNotOnThisBus{kNotThere, "not reachable",
                              ": it is not running on this bus. Start basebandd there."};
constexpr Words kStopped{kNotThere, "not reachable",
                         ": it has stopped. Start the service basebandd."};

const Words& wordsFor(const std::string& why, const std::string& bus, bool wasThere) {
  const auto* found = std::ranges::find(kWords, why, &Words::reason);
  if (found != kWords.end()) return *found;
  if (wasThere) return kStopped;
  return bus == "system" ? kNotInstalled : kNotOnThisBus;
}

QString noticeFor(const std::string& why, const std::string& bus, const QString& since) {
  const Words& words = wordsFor(why, bus, !since.isEmpty());
  QString notice = QStringLiteral("Baseband manager ") + QLatin1StringView(words.what);
  if (!since.isEmpty()) notice += QStringLiteral(" since ") + since;
  return notice + QLatin1StringView(words.more);
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
  _notice = reachable ? QString() : noticeFor(why, _bus, _since);
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
