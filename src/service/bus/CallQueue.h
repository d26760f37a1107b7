// The calls that wait to be answered.
#pragma once

#include <cstddef>
#include <deque>
#include <functional>
#include <map>
#include <string>
#include <string_view>

namespace qel::service {

// One of the two is called, once, unless the caller goes away before.
struct WaitingCall {
  std::function<void()> answer;
  std::function<void()> refuse;  // at little cost
};

// Callers are answered in turn, one call each, and every caller's calls in their order: whoever
// sends many waits for itself and not for others. Belongs to one thread.
class CallQueue {
 public:
  static constexpr std::size_t kMostOfOneCaller = 32;
  static constexpr std::size_t kMost = 256;

  // Refuses the call of a caller that has kMostOfOneCaller waiting, and beyond kMost calls the
  // newest of the caller that has most waiting.
  void add(const std::string& caller, WaitingCall call);
  bool isFullFor(std::string_view caller) const;

  bool empty() const { return _turns.empty(); }
  std::size_t size() const { return _size; }
  // Answers the next call, which may forget callers. There is one.
  void answerNext();

  // The caller has gone: nobody waits for its calls.
  void forget(const std::string& caller);

 private:
  void refuseNewestOfMost();

  std::map<std::string, std::deque<WaitingCall>, std::less<>> _waiting;  // none is empty
  std::deque<std::string> _turns;                                        // the callers, each once
  std::size_t _size = 0;
};

}  // namespace qel::service
