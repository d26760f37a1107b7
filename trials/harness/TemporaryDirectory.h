// A directory for one trial.
#pragma once

#include <string>

namespace qel::trials {

// Made with this object and removed with it.
class TemporaryDirectory {
 public:
  TemporaryDirectory();
  ~TemporaryDirectory();
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  const std::string& path() const { return _path; }

 private:
  std::string _path;
};

}  // namespace qel::trials
