#include "harness/Processes.h"

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <system_error>

namespace qel::trials {
namespace {

std::string folderOf(pid_t process) { return "/proc/" + std::to_string(process); }

std::uint64_t statusKb(pid_t process, const std::string& field) {
  std::ifstream status(folderOf(process) + "/status");
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with(field)) return std::stoull(line.substr(field.size()));
  }
  return 0;
}

}  // namespace

std::uint64_t residentKb(pid_t process) { return statusKb(process, "VmRSS:"); }
std::uint64_t mostResidentKb(pid_t process) { return statusKb(process, "VmHWM:"); }

std::uint64_t descriptorsOf(pid_t process) {
  std::error_code gone;
  const std::filesystem::directory_iterator open(folderOf(process) + "/fd", gone);
  if (gone) return 0;
  return static_cast<std::uint64_t>(std::distance(begin(open), end(open)));
}

}  // namespace qel::trials
