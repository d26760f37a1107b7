// Commands of a client with whatever their requests hold, as they come within the process and over
// the bus.

#include <array>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "fuzz/support/Variants.h"
#include "service/DeviceConfiguration.h"
#include "service/ServiceCore.h"
#include "service/support/FakeSource.h"
#include "tesk/Constants.h"
#include "tesk/bus/MessageConversion.h"

namespace qel::fuzz {
namespace {

constexpr int kMostCommands = 8;
constexpr std::size_t kLongestReason = 1000;
constexpr std::array kCommands = {tesk::kCommandAddConfiguration, tesk::kCommandClearConfiguration,
                                  tesk::kCommandQueryMetric, std::string_view("kCommandUnknown")};

void expectConfiguration(const Bytes& payload) {
  std::string reason;
  const auto configuration = service::DeviceConfiguration::fromPayload(payload, reason);
  law(configuration.has_value() == reason.empty(), "a refused configuration has a reason");
}

Dictionary request(Input& input) {
  enum { plain, overBus, withConfiguration, kinds };
  switch (input.below(kinds)) {
    case overBus:
      return tesk::bus::fromVariants(nextVariants(input, usualKeys())).entries();
    case withConfiguration: {
      const Bytes payload = input.piece();
      expectConfiguration(payload);
      return {{tesk::kKeyAppID, std::int64_t{input.byte()}},
              {tesk::kKeyPayload, payload},
              {tesk::kKeyPayloadType, std::int64_t{0}}};
    }
    default:
      return input.entries();
  }
}

void expectAnswer(const tesk::CommandResult& result) {
  law(result.code != 0 || result.message.empty(), "success needs no words");
  law(result.code == 0 || !result.message.empty(), "a refusal has a reason");
  law(result.message.size() < kLongestReason, "a reason is short");
  for (const char c : result.message) {
    law(static_cast<unsigned char>(c) >= ' ', "a reason is one line");
  }
}

}  // namespace

void tryInput(Input input) {
  const auto source = std::make_shared<testing::FakeSourceState>();
  source->answer.entries = testing::metricEvent(19972).entries;
  const auto core = service::ServiceCore::create(std::make_unique<testing::FakeSource>(source));
  std::uint64_t delivered = 0;
  const auto session =
      core->open("client", [&](std::string_view, const tesk::Message&) { ++delivered; });
  if ((input.byte() & 1) != 0) core->eventsOn(*session);
  for (int i = 0; i < kMostCommands && !input.empty(); ++i) {
    const std::string_view command = kCommands[input.below(kCommands.size())];
    expectAnswer(core->performCommand(*session, command, tesk::Message(request(input))));
    core->take(testing::metricEvent(19972));
    core->take(testing::triggerEvent(input.byte()));
  }
  const service::CoreStatus status = core->status();
  law(status.refusedCommands <= status.commands, "no more is refused than asked");
  law(status.delivered <= delivered, "what is delivered arrived");
  core->close(session);
}

}  // namespace qel::fuzz
