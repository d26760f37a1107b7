#include "harness/TemporaryDirectory.h"

#include <cstdlib>
#include <filesystem>
#include <stdexcept>
#include <system_error>

namespace qel::trials {

namespace fs = std::filesystem;

TemporaryDirectory::TemporaryDirectory()
    : _path((fs::temp_directory_path() / "qel-trial-XXXXXX").string()) {
  if (!::mkdtemp(_path.data())) throw std::runtime_error("no directory for the trial");
}

TemporaryDirectory::~TemporaryDirectory() {
  std::error_code left;
  fs::remove_all(_path, left);
}

}  // namespace qel::trials
