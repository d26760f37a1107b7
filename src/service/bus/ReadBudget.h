// How many calls that are answered at once a caller may make in one turn of the service.
#pragma once

#include <chrono>
#include <map>
#include <string>
#include <string_view>

namespace qel::service {

// Few are always answered; when all callers' have taken long in this turn, those of a caller that
// goes on are not. Whoever waits for one answer before the next call never comes so far. Belongs to
// one thread.
class ReadBudget {
 public:
  using Duration = std::chrono::steady_clock::duration;
  static constexpr Duration kOfAll = std::chrono::milliseconds(1);
  static constexpr int kOfOneCaller = 2;

  // Counts the call.
  bool allows(std::string_view caller);
  // That a call which was allowed took so long.
  void spend(Duration time) { _spent += time; }
  void nextTurn();

 private:
  std::map<std::string, int, std::less<>> _calls;  // of this turn, by caller
  Duration _spent{};
};

}  // namespace qel::service
