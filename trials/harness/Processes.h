// What the kernel tells about a process.
#pragma once

#include <sys/types.h>

#include <cstdint>

namespace qel::trials {

// In KiB; 0 when there is no such process.
std::uint64_t residentKb(pid_t process);
std::uint64_t mostResidentKb(pid_t process);
// Open descriptors.
std::uint64_t descriptorsOf(pid_t process);

}  // namespace qel::trials
