// Whole messages that are cut off or have wrong bits: nothing, or a plausible value.

#include <gtest/gtest.h>

#include <memory>

#include "rrc/LtePlausible.h"
#include "rrc/RandomRrc.h"
#include "rrc/SchemaFiles.h"

namespace qel::testing {
namespace {

using rrc::LteChannel;

struct Sample {
  LteChannel channel;
  Bytes pdu;
};

std::vector<Sample> samples() {
  const std::pair<LteChannel, const char*> channels[] = {
      {LteChannel::bcchBch, "BCCH-BCH-Message"}, {LteChannel::bcchDlSch, "BCCH-DL-SCH-Message"},
      {LteChannel::dlCcch, "DL-CCCH-Message"},   {LteChannel::dlDcch, "DL-DCCH-Message"},
      {LteChannel::ulCcch, "UL-CCCH-Message"},   {LteChannel::ulDcch, "UL-DCCH-Message"}};
  RandomRrc random(lteTables(), {.seed = 3, .foreign = true});
  std::vector<Sample> samples;
  for (int i = 0; i < 8; ++i) {
    for (const auto& [channel, name] : channels) {
      samples.push_back({channel, random.message(lteTables().message(name)).pdu});
    }
  }
  return samples;
}

// Reads from memory that ends where the message ends.
std::optional<rrc::LteMessage> readExactly(LteChannel channel, ByteView pdu) {
  const auto bytes = std::make_unique<std::uint8_t[]>(pdu.size());
  std::copy(pdu.begin(), pdu.end(), bytes.get());
  return rrc::readLteMessage(channel, {bytes.get(), pdu.size()});
}

void expectPlausible(LteChannel channel, ByteView pdu) {
  const auto message = readExactly(channel, pdu);
  if (!message) return;
  EXPECT_EQ(implausible(*message), "") << static_cast<int>(channel) << ' ' << hexText(pdu);
}

TEST(DamagedRrcMessages, areNothingOrPlausibleWhenCutOff) {
  for (const auto& [channel, pdu] : samples()) {
    ASSERT_TRUE(readExactly(channel, pdu)) << hexText(pdu);
    for (std::size_t size = 0; size < pdu.size(); ++size) {
      expectPlausible(channel, ByteView(pdu).first(size));
    }
  }
}

TEST(DamagedRrcMessages, areNothingOrPlausibleWithOneWrongBit) {
  for (auto [channel, pdu] : samples()) {
    for (std::size_t bit = 0; bit < pdu.size() * 8; ++bit) {
      const auto flipped = static_cast<std::uint8_t>(0x80U >> (bit % 8));
      pdu[bit / 8] ^= flipped;
      expectPlausible(channel, pdu);
      pdu[bit / 8] ^= flipped;
    }
  }
}

TEST(DamagedRrcMessages, areNothingOrPlausibleWhenAllOnes) {
  for (unsigned channel = 0; channel < 8; ++channel) {
    for (std::size_t size = 0; size < 300; ++size) {
      expectPlausible(static_cast<LteChannel>(channel), Bytes(size, 0xFF));
    }
  }
}

TEST(DamagedRrcMessages, missTheirEndWhenCutOff) {
  // A request needs all of its 48 bits.
  const Bytes request = {0x40, 0x12, 0x34, 0x56, 0x78, 0x96};
  EXPECT_TRUE(readExactly(LteChannel::ulCcch, request));
  for (std::size_t size = 0; size < request.size(); ++size) {
    EXPECT_FALSE(readExactly(LteChannel::ulCcch, ByteView(request).first(size))) << size;
  }
}

}  // namespace
}  // namespace qel::testing
