// Something else in the service's place, that hangs or lies; then the service again.

#include <array>
#include <csignal>
#include <thread>

#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr auto kEnough = 1500ms;
constexpr auto kQuestionEndsWithin = 8s;

// What the lying service is told to do; see its own list.
constexpr std::array kLies = {"never-answer", "wrong-types", "garbage",   "hang", "errors",
                              "close",        "a-file",      "over-long", "flood"};

// Whatever it is told, it ends in time, with an answer or without one.
void ask(Trial& trial, Stand& stand, const std::string& lie) {
  const auto question = stand.start("question", {QEL_QELCTL, "status", "--json"});
  const auto ended = question->process().waitForEnd(trial.stretched(kQuestionEndsWithin));
  promise(ended.has_value(), "qelctl status ends in time when the service does " + lie);
  promise(*ended == 0 || *ended == 69, "qelctl status ends in order when the service does " + lie +
                                           ", not with " + std::to_string(*ended));
}

void tell(Trial& trial, Stand& stand, const std::string& lie) {
  const std::string after = "after a service that did \"" + lie + "\"";
  stand.expectToEnd(stand.service(), "before the lie");
  {
    const auto liar = stand.start("liar", {QEL_LIAR, lie});
    const auto late = stand.start("late viewer", {QEL_QELWATCH});
    std::this_thread::sleep_for(kEnough);
    ask(trial, stand, lie);
    promise(!late->process().ended(), "a viewer starts beside a service that does " + lie);
    promise(!liar->process().ended(), "the lying service lies: " + liar->errors());
    stand.expectToEnd(*late, "beside a service that does " + lie);
  }
  ++trial.figures.tried;
  const auto start = Clock::now();
  stand.service().process().start();
  stand.expectValuesBack(after, start);
  stand.expectAllAlive(after);
  stand.expectConfigurationsKept(after);
}

}  // namespace

void lyingServices(Trial& trial) {
  Stand stand(trial, {.viewer = true, .recorder = true});
  for (int i = 0; i < trial.times; ++i) {
    tell(trial, stand, kLies.at(static_cast<std::size_t>(i) % kLies.size()));
  }
  stand.expectAllToEnd();
}

}  // namespace qel::trials
