#include "programs/Figures.h"

#include <sys/resource.h>
#include <time.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>

namespace qel::benchmarks {

std::chrono::microseconds timeOf(const timeval& time) {
  return std::chrono::seconds(time.tv_sec) + std::chrono::microseconds(time.tv_usec);
}

std::chrono::nanoseconds processorTime() {
  timespec time{};
  ::clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
  return std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
}

std::uint64_t wakeUps() {
  std::uint64_t sum = 0;
  for (const auto& thread : std::filesystem::directory_iterator("/proc/self/task")) {
    std::ifstream status(thread.path() / "status");
    const std::string wanted = "voluntary_ctxt_switches:";
    for (std::string line; std::getline(status, line);) {
      if (line.starts_with(wanted)) sum += std::stoull(line.substr(wanted.size()));
    }
  }
  return sum;
}

double percentile(std::vector<double> values, double share) {
  if (values.empty()) return NAN;
  const auto last = static_cast<double>(values.size() - 1);
  const auto rank = static_cast<std::ptrdiff_t>(std::lround(share * last));
  std::nth_element(values.begin(), values.begin() + rank, values.end());
  return values[static_cast<std::size_t>(rank)];
}

double median(std::vector<double> values) { return percentile(std::move(values), 0.5); }

void printRow(const std::string& what, const std::string& here, const std::string& beside,
              const std::string& reach) {
  std::printf("| %s | %s | %s | %s |\n", what.c_str(), here.c_str(), beside.c_str(), reach.c_str());
  std::fflush(stdout);
}

std::string text(double value, const char* unit, int digits) {
  std::array<char, 64> text;
  std::snprintf(text.data(), text.size(), "%.*f %s", digits, value, unit);
  return text.data();
}

}  // namespace qel::benchmarks
