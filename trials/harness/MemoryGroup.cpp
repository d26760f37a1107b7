#include "harness/MemoryGroup.h"

#include <unistd.h>

#include <array>
#include <atomic>
#include <filesystem>
#include <fstream>
#include <system_error>

namespace qel::trials {
namespace {

struct Hierarchy {
  const char* directory;
  const char* limit;
};

// The first version of control groups has a hierarchy for memory, the second has one for all.
constexpr std::array kHierarchies = {
    Hierarchy{"/sys/fs/cgroup/memory", "memory.limit_in_bytes"},
    Hierarchy{"/sys/fs/cgroup", "memory.max"},
};

bool put(const std::string& file, std::uint64_t number) {
  std::ofstream out(file);
  out << number << std::flush;
  return out.good();
}

}  // namespace

MemoryGroup::MemoryGroup() {
  static std::atomic<int> made = 0;
  const std::string name =
      "/qel-trial-" + std::to_string(::getpid()) + "-" + std::to_string(made++);
  for (const Hierarchy& hierarchy : kHierarchies) {
    const std::string directory = hierarchy.directory + name;
    std::error_code refused;
    if (!std::filesystem::create_directory(directory, refused) || refused) continue;
    const std::string limit = directory + "/" + hierarchy.limit;
    if (std::filesystem::exists(limit) && put(limit, kUnitMemoryKb * 1024)) {
      _directory = directory;
      return;
    }
    ::rmdir(directory.c_str());
  }
}

MemoryGroup::~MemoryGroup() {
  if (isThere()) ::rmdir(_directory.c_str());
}

}  // namespace qel::trials
