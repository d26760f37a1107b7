// A control group of the kernel that ends what uses too much memory.
#pragma once

#include <cstdint>
#include <string>

namespace qel::trials {

// The limit of the service's unit.
inline constexpr std::uint64_t kUnitMemoryKb = 64 * 1024;

// There until the end of this object, by when its processes must have ended. Where the machine
// allows no such group, isThere() is false and nothing is limited.
class MemoryGroup {
 public:
  MemoryGroup();
  ~MemoryGroup();
  MemoryGroup(const MemoryGroup&) = delete;
  MemoryGroup& operator=(const MemoryGroup&) = delete;

  bool isThere() const { return !_directory.empty(); }
  // The file to which a process writes 0 to become a member.
  std::string members() const { return _directory + "/cgroup.procs"; }

 private:
  std::string _directory;
};

}  // namespace qel::trials
