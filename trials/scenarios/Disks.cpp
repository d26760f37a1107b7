// No room on the disk, and files that may not grow.

#include <csignal>
#include <thread>

#include "harness/Mounts.h"
#include "harness/Proxy.h"
#include "harness/Requests.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"
#include "support/Subprocess.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr int kWriteError = 74;
constexpr auto kStateIsWritten = 1500ms;  // after a change, at the latest
constexpr auto kRecorderEndsWithin = 10s;
constexpr std::int64_t kApplication = 50;

// The service takes it, though it may not be able to keep it.
void install(Stand& stand, std::size_t metrics) {
  const auto connection = tesk::bus::connectTo({stand.bus().address()});
  Proxy proxy(*connection);
  const auto events = proxy.Register("trial");
  const auto answer = proxy.PerformCommand(
      "kCommandAddConfiguration", installRequest(kApplication, configurationOfMetrics(metrics)));
  promise(std::get<0>(answer) == 0, "a configuration is taken: " + std::get<1>(answer));
}

std::uint32_t installed(const Stand& stand) {
  const auto told = stand.status();
  promise(told.has_value(), "the service tells its status");
  const auto found = told->configurations.find(kApplication);
  return found == told->configurations.end() ? 0 : found->second;
}

void killAndRestart(Stand& stand, const std::string& after) {
  stand.service().process().signal(SIGKILL);
  stand.service().process().waitForEnd();
  const auto start = Clock::now();
  stand.service().process().start();
  stand.expectValuesBack(after, start);
  stand.expectConfigurationsKept(after);
}

void expectReadable(const std::string& recording) {
  const auto read = testing::run(QEL_QELCTL, {"store", recording});
  promise(read.exitCode == 0, "what was recorded until then can be read: " + read.err);
}

// It ends with one line and the code for it, by no signal.
void expectWriteError(Trial& trial, Program& program, const std::string& why) {
  const auto ended = program.process().waitForEnd(trial.stretched(kRecorderEndsWithin));
  promise(ended.has_value(), "the " + program.name() + " ends in time when " + why);
  promise(*ended == kWriteError, "the " + program.name() + " says that " + why +
                                     ", and does not "
                                     "end with " +
                                     std::to_string(*ended) + ": " + program.errors());
}

}  // namespace

void fullDisk(Trial& trial) {
  for (int i = 0; i < trial.times; ++i) {
    const std::string name = "/tmp/qel-trial-disk-" + std::to_string(::getpid());
    const SmallDisk disk(name, 256 * 1024);
    Stand stand(trial, {.stateDirectory = name});
    std::this_thread::sleep_for(kStateIsWritten);
    disk.fill();
    ++trial.figures.tried;
    install(stand, 3);
    stand.expectValues("with a full disk");
    std::this_thread::sleep_for(kStateIsWritten);
    killAndRestart(stand, "after a kill with a full disk");
    disk.empty();
    install(stand, 4);
    std::this_thread::sleep_for(kStateIsWritten);
    killAndRestart(stand, "after a kill with room again");
    promise(installed(stand) == 4, "a configuration is kept once there is room again");
    const std::string recording = name + "/recorded.jsonl";
    const auto recorder =
        stand.start("recorder", {QEL_QELCTL, "record", "--min-free", "0", recording});
    expectWriteError(trial, *recorder, "the disk is full");
    expectReadable(recording);
    stand.expectAllToEnd();
  }
}

void shortFiles(Trial& trial) {
  for (int i = 0; i < trial.times; ++i) {
    Stand stand(trial, {.fileBlocksOfService = 0});
    ++trial.figures.tried;
    install(stand, 3);
    stand.expectValues("when the service may write no file");
    promise(installed(stand) == 3, "a configuration holds when it cannot be kept");
    const std::string recording = stand.directory() + "/short.jsonl";
    const auto recorder =
        stand.start("recorder", {QEL_QELCTL, "record", recording}, {.fileBlocks = 64});
    expectWriteError(trial, *recorder, "its file may not grow");
    expectReadable(recording);
    const auto onFull = [&stand](const std::string& program, std::vector<std::string> words) {
      return stand.start(program, std::move(words), {.out = "/dev/full"});
    };
    const auto lines = onFull("live", {QEL_QELCTL, "live"});
    expectWriteError(trial, *lines, "its output takes nothing");
    const auto stream = onFull("record", {QEL_QELCTL, "record", "-"});
    expectWriteError(trial, *stream, "its output takes nothing");
    const auto viewer = onFull("viewer", {QEL_QELWATCH});
    std::this_thread::sleep_for(1s);
    promise(!viewer->process().ended(), "a viewer whose output takes nothing goes on");
    stand.expectToEnd(*viewer, "when its output takes nothing");
    stand.expectAllToEnd();
  }
}

}  // namespace qel::trials
