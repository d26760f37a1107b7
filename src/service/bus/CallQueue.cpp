#include "service/bus/CallQueue.h"

#include <algorithm>
#include <utility>

namespace qel::service {

bool CallQueue::isFullFor(std::string_view caller) const {
  const auto found = _waiting.find(caller);
  return found != _waiting.end() && found->second.size() >= kMostOfOneCaller;
}

void CallQueue::add(const std::string& caller, WaitingCall call) {
  if (isFullFor(caller)) {
    call.refuse();
    return;
  }
  auto& calls = _waiting[caller];
  if (calls.empty()) _turns.push_back(caller);
  calls.push_back(std::move(call));
  if (++_size > kMost) refuseNewestOfMost();
}

void CallQueue::refuseNewestOfMost() {
  const auto most = std::ranges::max_element(
      _waiting, {}, [](const auto& caller) { return caller.second.size(); });
  const WaitingCall refused = std::move(most->second.back());
  most->second.pop_back();
  --_size;
  if (most->second.empty()) forget(std::string(most->first));
  refused.refuse();
}

void CallQueue::answerNext() {
  const std::string caller = std::move(_turns.front());
  _turns.pop_front();
  const auto found = _waiting.find(caller);
  const WaitingCall call = std::move(found->second.front());
  found->second.pop_front();
  --_size;
  if (found->second.empty()) {
    _waiting.erase(found);
  } else {
    _turns.push_back(caller);
  }
  call.answer();
}

void CallQueue::forget(const std::string& caller) {
  const auto found = _waiting.find(caller);
  if (found == _waiting.end()) return;
  _size -= found->second.size();
  _waiting.erase(found);
  std::erase(_turns, caller);
}

}  // namespace qel::service
