// Whether two names are one file.
#pragma once

#include <sys/stat.h>

#include <string>

namespace qel::tools {

// No where one of them is not there.
inline bool isSameFile(const std::string& one, const std::string& other) {
  struct stat first {};
  struct stat second {};
  return ::stat(one.c_str(), &first) == 0 && ::stat(other.c_str(), &second) == 0 &&
         first.st_dev == second.st_dev && first.st_ino == second.st_ino;
}

}  // namespace qel::tools
