// A server that hangs: its socket is cut off, upon which the library's call fails.
#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <optional>
#include <thread>

namespace qel::fleet {

// How long somebody waits for the answer to a statement.
struct AnswerPatience {
  std::chrono::milliseconds statement{60'000};
  std::function<bool()> isToEnd = [] { return false; };  // then 10 s at the most; any thread
};

// One thread waits for answers, one of its own watches it.
class AnswerWatch {
 public:
  explicit AnswerWatch(AnswerPatience patience);

  // The server on that socket answers from now on within its patience, and 5 s more in which it may
  // say itself that it took too long. The socket stays open until the answer.
  void expect(int socket);
  void answered();
  bool hasGivenUp() const;

 private:
  using Clock = std::chrono::steady_clock;

  void watch(const std::stop_token& stop);
  void look();

  const AnswerPatience _patience;
  mutable std::mutex _mutex;
  std::condition_variable_any _changed;
  int _socket = -1;  // none is expected
  Clock::time_point _deadline;
  std::optional<Clock::time_point> _end;
  bool _hasGivenUp = false;
  std::jthread _thread;
};

}  // namespace qel::fleet
