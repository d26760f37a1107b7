// The service beside qelctl, on a bus of the test's own.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "bus/ServiceProcess.h"
#include "support/PrivateBus.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {

class WithService : public ::testing::Test {
 protected:
  WithService() {
    std::string pattern = (std::filesystem::temp_directory_path() / "qelctl-XXXXXX").string();
    directory = ::mkdtemp(pattern.data());
  }
  ~WithService() override { std::filesystem::remove_all(directory); }

  // The words of a command that talks to this service.
  std::vector<std::string> words(std::vector<std::string> arguments) const {
    arguments.insert(arguments.begin() + 1, {"--bus", bus.address()});
    return arguments;
  }
  Outcome ask(std::vector<std::string> arguments) const {
    return qelctl(words(std::move(arguments)));
  }
  std::string file(const std::string& name) const { return directory + "/" + name; }

  std::string directory;
  PrivateBus bus;
  ServiceProcess service{bus, "simulated,speed=20"};
};

}  // namespace qel::testing
