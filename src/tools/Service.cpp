#include "tools/Service.h"

#include <CLI/CLI.hpp>
#include <chrono>
#include <filesystem>
#include <memory>
#include <system_error>
#include <thread>
#include <utility>

#include "base/DispatchQueue.h"
#include "base/FileContent.h"
#include "tesk/bus/Reasons.h"
#include "tesk/bus/ServiceStatus.h"
#include "tools/ToolError.h"
#include "ui/kit/ResourceBundle.h"

namespace qel::tools {
namespace {

using namespace std::chrono_literals;

constexpr const char* kService = "baseband manager service";
constexpr const char* kConfigurationName = "orb_test_lte";
constexpr const char* kConfigurationType = "deviceconfig";
constexpr std::size_t kLargestConfiguration = 1024 * 1024;  // bytes

// "baseband manager service does not answer" after "baseband manager service: ".
std::string withoutItsName(const std::string& why) {
  return why.starts_with(tesk::bus::kTheService) ? why.substr(tesk::bus::kTheService.size()) : why;
}

}  // namespace

void addBusOption(CLI::App& command, std::string& bus) {
  command.add_option("--bus", bus, "Where the service is: system, session or a bus address")
      ->type_name("BUS")
      ->capture_default_str();
}

void failWithoutService(const std::string& why) {
  throw ToolError(EX_UNAVAILABLE, kService, withoutItsName(why));
}

void requireService(const std::string& bus) {
  constexpr auto kPatience = 2s;
  constexpr auto kPause = 100ms;
  const auto end = std::chrono::steady_clock::now() + kPatience;
  std::string why;
  while (!tesk::bus::readServiceStatus({bus}, why)) {
    if (std::chrono::steady_clock::now() >= end) failWithoutService(why);
    std::this_thread::sleep_for(kPause);
  }
}

tesk::bus::ReachabilityObserver serviceObserver(std::function<void(const std::string&)> say,
                                                std::function<void()> back) {
  struct State {
    std::function<void(const std::string&)> say;
    std::function<void()> back;
    bool lost = false;  // main thread only
    bool wasThere = false;
  };
  const auto state = std::make_shared<State>(State{std::move(say), std::move(back)});
  return [state](bool reachable, const std::string& why) {
    MainQueue::shared().async([state, reachable, why] {
      const bool wasLost = std::exchange(state->lost, !reachable);
      if (!reachable) {
        const char* what = !state->wasThere ? "waiting for it: "
                           : wasLost        ? "still waiting for it: "
                                            : "lost, waiting for it: ";
        state->say(std::string(kService) + ": " + what + withoutItsName(why));
      } else if (wasLost) {
        state->say(std::string(kService) + (state->wasThere ? ": back" : ": there"));
        state->back();
      }
      state->wasThere = state->wasThere || reachable;
    });
  };
}

void findResources() {
  std::error_code error;
  const auto program = std::filesystem::read_symlink("/proc/self/exe", error);
  const auto directory = program.parent_path() / ".." / "share" / "qelwatch";
  ResourceBundle::setMain(std::make_shared<DirectoryBundle>(directory.string()));
}

std::string configurationFile() {
  const auto path = ResourceBundle::main().pathForResource(kConfigurationName, kConfigurationType);
  if (!path) {
    throw ToolError(EX_NOINPUT, std::string(kConfigurationName) + "." + kConfigurationType,
                    "not in ../share/qelwatch beside the program");
  }
  return *path;
}

Bytes configuration() { return contentOfFile(configurationFile(), kLargestConfiguration); }

}  // namespace qel::tools
