#include "soak/Samples.h"

#include <algorithm>
#include <numeric>

#include "harness/Processes.h"

namespace qel::trials {
namespace {

using Values = std::vector<std::uint64_t>;

Values quarterOf(const Values& values, std::size_t quarter) {
  const auto at = [&values](std::size_t part) {
    return values.begin() + static_cast<std::ptrdiff_t>(values.size() * part / 4);
  };
  return {at(quarter), at(quarter + 1)};
}

std::uint64_t most(const Values& values) {
  return values.empty() ? 0 : *std::ranges::max_element(values);
}

}  // namespace

void Samples::look() {
  _kb.push_back(residentKb(_process));
  _descriptors.push_back(descriptorsOf(_process));
}

double Samples::mean(const Values& values, std::size_t quarter) {
  const Values part = quarterOf(values, quarter);
  if (part.empty()) return 0;
  const auto sum = std::accumulate(part.begin(), part.end(), std::uint64_t{0});
  return static_cast<double>(sum) / static_cast<double>(part.size());
}

std::uint64_t Samples::firstDescriptors() const { return most(quarterOf(_descriptors, 0)); }
std::uint64_t Samples::lastDescriptors() const { return most(quarterOf(_descriptors, 3)); }

bool Samples::isFlat() const {
  constexpr double kFactor = 1.05;
  constexpr double kMoreKb = 1024;
  return _kb.size() >= 4 && firstKb() > 0 && lastKb() <= firstKb() * kFactor + kMoreKb &&
         lastDescriptors() <= firstDescriptors();
}

}  // namespace qel::trials
