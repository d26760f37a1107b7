#include "fleet/LinkWait.h"

#include <poll.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <limits>

namespace qel::fleet {

short waitForLink(const BrokerLink* link, const WakeUp& wakeUp,
                  std::optional<std::chrono::steady_clock::time_point> until) {
  int patience = -1;
  if (until) {
    const auto left = *until - std::chrono::steady_clock::now();
    patience = static_cast<int>(
        std::clamp<std::int64_t>(std::chrono::ceil<std::chrono::milliseconds>(left).count(), 0,
                                 std::numeric_limits<int>::max()));
  }
  std::array<pollfd, 2> waited = {{{wakeUp.descriptor(), POLLIN, 0}, {-1, POLLIN, 0}}};
  if (link) {
    waited[1].fd = link->descriptor();
    if (link->wantsToWrite()) waited[1].events |= POLLOUT;
  }
  ::poll(waited.data(), waited.size(), patience);
  wakeUp.clear();
  return waited[1].revents;
}

}  // namespace qel::fleet
