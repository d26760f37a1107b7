#include "fleet/LinkWait.h"

#include <poll.h>

#include <array>

#include "base/PollTimeout.h"

namespace qel::fleet {

short waitForLink(const BrokerLink* link, const WakeUp& wakeUp,
                  std::optional<std::chrono::steady_clock::time_point> until) {
  std::array<pollfd, 2> waited = {{{wakeUp.descriptor(), POLLIN, 0}, {-1, POLLIN, 0}}};
  if (link) {
    waited[1].fd = link->descriptor();
    if (link->wantsToWrite()) waited[1].events |= POLLOUT;
  }
  ::poll(waited.data(), waited.size(), pollTimeout(until));
  wakeUp.clear();
  return waited[1].revents;
}

}  // namespace qel::fleet
