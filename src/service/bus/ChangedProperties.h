// Which properties have changed since that was last signalled.
#pragma once

#include <chrono>
#include <initializer_list>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace qel::service {

// Spaces out the signals: the first change is due at once, those that follow together a moment
// later, and the last one always. Belongs to one thread; the caller brings the time.
class ChangedProperties {
 public:
  using Moment = std::chrono::steady_clock::time_point;
  static constexpr std::chrono::milliseconds kSpacing{250};

  void note(std::initializer_list<const char*> names);

  // When take will give something; nothing when nothing changed.
  std::optional<Moment> due() const;
  // Those to be signalled now, often none.
  std::vector<std::string> take(Moment now);

 private:
  std::set<std::string> _names;
  std::optional<Moment> _takenAt;
};

}  // namespace qel::service
