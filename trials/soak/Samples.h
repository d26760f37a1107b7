// How much memory and how many descriptors a process has had, from the first to the last look.
#pragma once

#include <sys/types.h>

#include <cstdint>
#include <string>
#include <vector>

namespace qel::trials {

class Samples {
 public:
  Samples(std::string name, pid_t process) : _name(std::move(name)), _process(process) {}

  void look();

  const std::string& name() const { return _name; }
  // Means of the first and of the last quarter.
  double firstKb() const { return mean(_kb, 0); }
  double lastKb() const { return mean(_kb, 3); }
  std::uint64_t firstDescriptors() const;
  std::uint64_t lastDescriptors() const;
  // Does the last quarter have no more than the first, but for 5 % and one MiB, and no more
  // descriptors at any time?
  bool isFlat() const;

 private:
  static double mean(const std::vector<std::uint64_t>& values, std::size_t quarter);

  const std::string _name;
  const pid_t _process;
  std::vector<std::uint64_t> _kb;
  std::vector<std::uint64_t> _descriptors;
};

}  // namespace qel::trials
