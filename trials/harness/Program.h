// A program under trial, and what it has said since somebody last listened.
#pragma once

#include <string>
#include <vector>

#include "support/ChildProcess.h"

namespace qel::trials {

struct Conditions {
  std::string memoryGroup = {};  // file to join it by; empty: none
  long fileBlocks = -1;          // of 512 bytes, the longest file; negative: no limit
  std::vector<std::string> environment = {};
  std::string out = {};  // instead of a file of its own
};

// Says something into files of its own in the directory. Killed at the end of this object.
class Program {
 public:
  Program(const std::string& directory, std::string name, std::vector<std::string> words,
          const Conditions& conditions = {});

  const std::string& name() const { return _name; }
  testing::ChildProcess& process() { return _process; }

  void forgetWhatItSaid() const;
  bool hasSaid(const std::string& text) const;
  std::string errors() const;

 private:
  const std::string _name;
  testing::ChildProcess _process;
};

// Lets a viewer draw off screen, keep its files in the directory and talk to no desktop.
std::vector<std::string> offScreen(const std::string& directory);

// What stands in the file.
std::string textOf(const std::string& file);

}  // namespace qel::trials
