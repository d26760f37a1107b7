// Bus, service and those who watch, as on a phone.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "harness/MemoryGroup.h"
#include "harness/Program.h"
#include "harness/TemporaryDirectory.h"
#include "harness/Trial.h"
#include "support/PrivateBus.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::trials {

struct Cast {
  bool screen = true;  // qelctl live on a category whose values never rest
  bool viewer = false;
  bool recorder = false;
  std::string source = "simulated,speed=50";
  std::vector<std::string> environment = {};  // of all programs
  std::string stateDirectory = {};            // empty: one of its own
  std::string viewersLines = {};              // empty: a file of its own
  long fileBlocksOfService = -1;
};

inline constexpr milliseconds kBackWithin{5000};
inline constexpr milliseconds kEndsWithin{2000};

// Made when everybody sees values. At its end everything is killed and every file is gone. A
// BrokenPromise comes from whatever finds one; sdbus::Error from nothing.
class Stand {
 public:
  Stand(Trial& trial, Cast cast);

  testing::PrivateBus& bus() { return _bus; }
  const std::string& directory() const { return _directory.path(); }
  std::string recording() const { return directory() + "/recorded.jsonl"; }
  std::string stateDirectory() const;
  Program& service() { return *_service; }
  Program& viewer() { return *_viewer; }
  Program& recorder() { return *_recorder; }
  Program& screen() { return *_screen; }

  // In place of the service that was, which has ended.
  void startService(const std::string& source);
  // A program that talks to the bus of the stand, such as qelctl with its words.
  std::unique_ptr<Program> start(std::string name, std::vector<std::string> words,
                                 Conditions conditions = {}) const;

  // Everybody sees values that are younger than this call within the time.
  void expectValues(const std::string& after, milliseconds within = kBackWithin);
  // The same; the time since the fault counts, and goes into the figures.
  void expectValuesBack(const std::string& after, Clock::time_point since);
  // Nobody has ended that nobody ended.
  void expectAllAlive(const std::string& after);
  // The configurations of the cast are what they were at first.
  void expectConfigurationsKept(const std::string& after);
  // Ends on SIGTERM in time, and as it should.
  void expectToEnd(Program& program, const std::string& when);
  // All of the cast, one after the other.
  void expectAllToEnd();

  std::optional<tesk::bus::ServiceStatus> status() const;
  // Notes the service's memory, which must stay below its limit.
  void lookAtMemory(const std::string& during);

 private:
  struct Witness {
    Program* program;
    std::string file;  // where values go
    std::string sign;  // text of a value; empty: any growth
    std::uintmax_t size = 0;
  };

  void waitForService();
  void addWitnesses();
  std::string missingConfiguration() const;
  bool seesValues(const Witness& witness) const;
  std::vector<Program*> programs() const;

  Trial& _trial;
  const Cast _cast;
  const TemporaryDirectory _directory;
  testing::PrivateBus _bus;
  MemoryGroup _group;
  std::unique_ptr<Program> _service;
  std::unique_ptr<Program> _screen;
  std::unique_ptr<Program> _viewer;
  std::unique_ptr<Program> _recorder;
  std::vector<Witness> _witnesses;
  std::map<std::int64_t, std::uint32_t> _configurations;
};

}  // namespace qel::trials
