// RRC messages, as they come from the air or from whatever calls itself a modem.

#include <algorithm>
#include <memory>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "rrc/LtePlausible.h"
#include "rrc/reader/Walker.h"

namespace qel::fuzz {
namespace {

constexpr std::size_t kChannels = 9;  // the last one is none

// In memory that ends where the message ends.
std::optional<rrc::LteMessage> readExactly(rrc::LteChannel channel, ByteView pdu) {
  const auto bytes = std::make_unique<std::uint8_t[]>(pdu.size());
  std::copy(pdu.begin(), pdu.end(), bytes.get());
  return rrc::readLteMessage(channel, {bytes.get(), pdu.size()});
}

void tryLte(rrc::LteChannel channel, const Bytes& pdu) {
  const auto message = readExactly(channel, pdu);
  law(readExactly(channel, pdu) == message, "the same bits say the same");
  if (!message) return;
  const std::string implausible = testing::implausible(*message);
  law(implausible.empty(), "no message can say this: " + implausible);

  if (pdu.size() == rrc::kLongestMessage) return;
  Bytes longer = pdu;
  longer.resize(longer.size() + 1);
  law(readExactly(channel, longer) == message, "what stands behind a message changes nothing");
}

}  // namespace

void tryInput(Input input) {
  const auto channel = static_cast<rrc::LteChannel>(input.below(kChannels));
  tryLte(channel, input.rest());
}

}  // namespace qel::fuzz
