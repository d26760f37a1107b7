// The service's state as a file.
#pragma once

#include <string>

#include "service/StateKeeper.h"

namespace qel::service {

// `directory`/state, readable by its owner only. It is replaced as a whole: whatever happens, a
// reader finds the old state or the new one.
class StateFile final : public StateKeeper {
 public:
  explicit StateFile(std::string directory);

  KeptState load() override;
  void save(const KeptState& state) override;

 private:
  const std::string _directory;
};

}  // namespace qel::service
