// The service's state as a file.
#pragma once

#include <cstddef>
#include <string>

#include "service/StateKeeper.h"

namespace qel::service {

// `directory`/state, readable by its owner only. It is replaced as a whole: whatever happens, a
// reader finds the old state or the new one. What cannot be read, is no regular file, too large or
// damaged is one log line and no state; what cannot be written is a line when that begins.
class StateFile final : public StateKeeper {
 public:
  static constexpr std::size_t kLargest = std::size_t{512} << 10;  // bytes

  explicit StateFile(std::string directory);

  KeptState load() override;
  void save(const KeptState& state) override;

 private:
  // Empty, or the line that says what went wrong.
  std::string replaceBy(const Bytes& content) const;

  const std::string _directory;
  std::string _failure;  // of the last save
};

}  // namespace qel::service
