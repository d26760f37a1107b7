// A folder that is gone with the test.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <string>

namespace qel::testing {

class Folder {
 public:
  Folder() {
    std::string pattern = (std::filesystem::temp_directory_path() / "qel-fleet-XXXXXX").string();
    if (!::mkdtemp(pattern.data())) std::abort();
    _path = pattern;
  }
  ~Folder() { std::filesystem::remove_all(_path); }
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;

  const std::string& path() const { return _path; }

 private:
  std::string _path;
};

}  // namespace qel::testing
