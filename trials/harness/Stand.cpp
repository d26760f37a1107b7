#include "harness/Stand.h"

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <system_error>
#include <thread>

#include "harness/Processes.h"

namespace qel::trials {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;

constexpr auto kFirstValuesWithin = 20s;
constexpr auto kLook = 10ms;

std::uintmax_t sizeOf(const std::string& file) {
  std::error_code none;
  const auto size = fs::file_size(file, none);
  return none ? 0 : size;
}

milliseconds since(Clock::time_point time) {
  return std::chrono::ceil<milliseconds>(Clock::now() - time);
}

}  // namespace

Stand::Stand(Trial& trial, Cast cast) : _trial(trial), _cast(std::move(cast)) {
  fs::create_directories(stateDirectory());
  startService(_cast.source);
  waitForService();
  if (_cast.screen) {
    _screen = start("screen", {QEL_QELCTL, "live", "--screen", "UMTS", "NAS GMM"});
  }
  if (_cast.viewer) _viewer = start("viewer", {QEL_QELWATCH}, {.out = _cast.viewersLines});
  if (_cast.recorder) {
    _recorder = start("recorder", {QEL_QELCTL, "record", "--force", recording()});
  }
  addWitnesses();
  expectValues("at first", kFirstValuesWithin);
  const auto told = status();
  promise(told.has_value(), "the service tells its status at first");
  _configurations = told->configurations;
}

std::string Stand::stateDirectory() const {
  return _cast.stateDirectory.empty() ? directory() + "/state" : _cast.stateDirectory;
}

void Stand::startService(const std::string& source) {
  Conditions conditions;
  if (_group.isThere()) conditions.memoryGroup = _group.members();
  conditions.fileBlocks = _cast.fileBlocksOfService;
  _service = start("service", {QEL_BASEBANDD, "--source", source, "--state", stateDirectory()},
                   std::move(conditions));
}

std::unique_ptr<Program> Stand::start(std::string name, std::vector<std::string> words,
                                      Conditions conditions) const {
  words.insert(words.end(), {"--bus", _bus.address()});
  conditions.environment = _cast.environment;
  const auto more = offScreen(directory());
  conditions.environment.insert(conditions.environment.end(), more.begin(), more.end());
  return std::make_unique<Program>(directory(), std::move(name), std::move(words), conditions);
}

void Stand::waitForService() {
  const auto deadline = Clock::now() + _trial.stretched(kFirstValuesWithin);
  while (!status()) {
    promise(Clock::now() < deadline, "the service is there soon after its start");
    std::this_thread::sleep_for(kLook);
  }
}

void Stand::addWitnesses() {
  if (_screen) _witnesses.push_back({_screen.get(), directory() + "/screen.out", "reg_status"});
  if (_viewer && _cast.viewersLines.empty()) {
    _witnesses.push_back({_viewer.get(), directory() + "/viewer.out", "Received Valid Metric"});
  }
  if (_recorder) _witnesses.push_back({_recorder.get(), recording(), ""});
}

bool Stand::seesValues(const Witness& witness) const {
  if (witness.sign.empty()) return sizeOf(witness.file) != witness.size;
  return witness.program->hasSaid(witness.sign);
}

void Stand::expectValues(const std::string& after, milliseconds within) {
  for (Witness& witness : _witnesses) {
    witness.size = sizeOf(witness.file);
    if (!witness.sign.empty()) witness.program->forgetWhatItSaid();
  }
  const auto deadline = Clock::now() + _trial.stretched(within);
  for (const Witness& witness : _witnesses) {
    while (!seesValues(witness)) {
      promise(Clock::now() < deadline,
              "values in time " + after + ": none at the " + witness.program->name());
      std::this_thread::sleep_for(kLook);
    }
  }
}

void Stand::expectValuesBack(const std::string& after, Clock::time_point fault) {
  expectValues(after, std::max(0ms, kBackWithin - since(fault)));
  _trial.figures.sawBack(since(fault));
}

std::vector<Program*> Stand::programs() const {
  std::vector<Program*> all;
  for (const auto* program : {&_recorder, &_viewer, &_screen, &_service}) {
    if (*program) all.push_back(program->get());
  }
  return all;
}

void Stand::expectAllAlive(const std::string& after) {
  for (Program* program : programs()) {
    const auto ended = program->process().ended();
    promise(!ended, "everybody goes on " + after + ": the " + program->name() + " ended with " +
                        std::to_string(ended.value_or(0)) + ": " + program->errors());
  }
}

// One that comes into service again takes its configuration away and installs it anew.
void Stand::expectConfigurationsKept(const std::string& after) {
  const auto deadline = Clock::now() + _trial.stretched(kBackWithin);
  for (std::string missing = missingConfiguration(); !missing.empty();
       missing = missingConfiguration()) {
    promise(Clock::now() < deadline, missing + " is kept " + after);
    std::this_thread::sleep_for(kLook);
  }
}

std::string Stand::missingConfiguration() const {
  const auto told = status();
  if (!told) return "the service's status";
  for (const auto& [application, metrics] : _configurations) {
    const auto kept = told->configurations.find(application);
    if (kept == told->configurations.end() || kept->second != metrics) {
      return "the configuration of application " + std::to_string(application);
    }
  }
  return "";
}

void Stand::expectToEnd(Program& program, const std::string& when) {
  program.process().signal(SIGTERM);
  const auto ended = program.process().waitForEnd(_trial.stretched(kEndsWithin));
  promise(ended.has_value(), "SIGTERM ends the " + program.name() + " in time " + when);
  promise(*ended == 0, "the " + program.name() + " ends in order " + when + ", not with " +
                           std::to_string(*ended) + ": " + program.errors());
}

void Stand::expectAllToEnd() {
  lookAtMemory("to the end");
  for (Program* program : programs()) {
    if (!program->process().ended()) expectToEnd(*program, "at the end");
  }
}

std::optional<tesk::bus::ServiceStatus> Stand::status() const {
  std::string why;
  return tesk::bus::readServiceStatus({_bus.address()}, why);
}

void Stand::lookAtMemory(const std::string& during) {
  const auto most = mostResidentKb(_service->process().pid());
  _trial.figures.sawMemory(most);
  promise(most < kUnitMemoryKb, "the service stays below the memory of its unit " + during +
                                    ": it had " + std::to_string(most) + " KiB");
}

}  // namespace qel::trials
