// Another reader of the same messages, field by field: tshark. Where it is not installed these
// tests are skipped.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <set>

#include "rrc/BitWriter.h"
#include "rrc/Captures.h"
#include "rrc/Judge.h"
#include "rrc/LteValues.h"
#include "rrc/RandomRrc.h"
#include "rrc/SchemaFiles.h"
#include "rrc/lte/Messages.h"

namespace qel::testing {
namespace {

using rrc::lte::Channel;

struct ChannelNames {
  const char* message;
  const char* dissector;
};

constexpr std::array kChannels = {
    // in the order of Channel
    ChannelNames{"BCCH-BCH-Message", "lte_rrc.bcch_bch"},
    ChannelNames{"BCCH-DL-SCH-Message", "lte_rrc.bcch_dl_sch"},
    ChannelNames{"MCCH-Message", "lte_rrc.mcch"},
    ChannelNames{"PCCH-Message", "lte_rrc.pcch"},
    ChannelNames{"DL-CCCH-Message", "lte_rrc.dl_ccch"},
    ChannelNames{"DL-DCCH-Message", "lte_rrc.dl_dcch"},
    ChannelNames{"UL-CCCH-Message", "lte_rrc.ul_ccch"},
    ChannelNames{"UL-DCCH-Message", "lte_rrc.ul_dcch"},
};

const Peculiarities kPeculiarities = {
    {"serialNumber", "warningType", "warningMessageSegment", "messageIdentifier",
     "dataCodingScheme", "ellipsoid-Point-r10", "ellipsoidPointWithAltitude-r10",
     "horizontalVelocity-r10", "gnss-TOD-msec-r10", "targetRAT-MessageContainer"},
    {"sr-Periodicity", "sr-SubframeOffset", "hnb-Name", "fragment", "fragments"},
};

JudgedType judged(Channel channel, Bytes pdu) {
  const ChannelNames& names = kChannels[static_cast<std::size_t>(channel)];
  return {lteTables().message(names.message), {names.dissector, std::move(pdu)}};
}

std::vector<std::vector<Shown>> shownOf(const std::vector<JudgedType>& messages) {
  std::vector<JudgedMessage> plain;
  for (const JudgedType& message : messages) plain.push_back(message.message);
  return shownByTshark(plain, "lte_rrc", "lte-rrc.");
}

void expectAgreement(const std::vector<JudgedType>& messages, bool mayShowMore) {
  constexpr std::size_t kMostShown = 5;
  const auto judgement =
      judge(lteTables(), messages, shownOf(messages), kPeculiarities, mayShowMore);
  ::testing::Test::RecordProperty("messages", static_cast<int>(messages.size()));
  ::testing::Test::RecordProperty("fields", static_cast<int>(judgement.fields));
  ::testing::Test::RecordProperty("kinds", static_cast<int>(judgement.kinds.size()));
  EXPECT_GT(judgement.fields, messages.size());
  EXPECT_TRUE(judgement.differences.empty())
      << judgement.differences.size() << " differences in " << judgement.fields << " fields of "
      << messages.size() << " messages";
  for (std::size_t i = 0; i < std::min(kMostShown, judgement.differences.size()); ++i) {
    ADD_FAILURE() << judgement.differences[i];
  }
}

// Channels of which more than the message's name is read, those with more to read more often.
constexpr std::array kReadChannels = {
    Channel::bcchBch, Channel::bcchDlSch, Channel::bcchDlSch, Channel::dlCcch, Channel::dlCcch,
    Channel::dlDcch,  Channel::dlDcch,    Channel::dlDcch,    Channel::ulCcch, Channel::ulDcch};

// What tshark looks into must not be random.
const std::set<std::string> kNotRandom = {"locationInfo-r10", "handover"};

std::vector<JudgedType> randomMessages(unsigned seed, std::size_t count) {
  RandomRrc random(lteTables(), {.seed = seed, .never = kNotRandom});
  std::vector<JudgedType> messages;
  for (std::size_t i = 0; i < count; ++i) {
    const Channel channel = kReadChannels[i % kReadChannels.size()];
    const ChannelNames& names = kChannels[static_cast<std::size_t>(channel)];
    messages.push_back(judged(channel, random.message(lteTables().message(names.message)).pdu));
  }
  return messages;
}

TEST(TsharkJudge, readsRandomMessagesAlike) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  expectAgreement(randomMessages(1, 4000), false);
}

// Random system information may hold a block twice; its values are those of the last.
bool repeatsABlock(const std::vector<Shown>& shown) {
  std::set<std::string> blocks;
  return std::any_of(shown.begin(), shown.end(), [&](const Shown& one) {
    return one.name == "sib-TypeAndInfo-item" && !blocks.insert(one.value).second;
  });
}

void expectValuesAsShown(const std::vector<JudgedType>& messages,
                         const std::vector<Channel>& channels) {
  constexpr int kMostShown = 5;
  const auto shown = shownOf(messages);
  std::size_t claims = 0;
  int contradictions = 0;
  for (std::size_t i = 0; i < messages.size(); ++i) {
    if (repeatsABlock(shown[i])) continue;
    const auto message = rrc::readLteMessage(channels[i], messages[i].message.pdu);
    ASSERT_TRUE(message) << hexText(messages[i].message.pdu);
    for (const Claim& claim : claimsOf(*message)) {
      ++claims;
      const std::string text = contradiction(claim, shown[i]);
      if (text.empty() || ++contradictions > kMostShown) continue;
      ADD_FAILURE() << messages[i].message.dissector << ' ' << hexText(messages[i].message.pdu)
                    << '\n'
                    << text;
    }
  }
  ::testing::Test::RecordProperty("claims", static_cast<int>(claims));
  EXPECT_GT(claims, messages.size());
  EXPECT_EQ(contradictions, 0);
}

TEST(TsharkJudge, showsTheValuesThatAreMadeOfRandomMessages) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  const auto messages = randomMessages(2, 3000);
  std::vector<Channel> channels;
  for (std::size_t i = 0; i < messages.size(); ++i) {
    channels.push_back(kReadChannels[i % kReadChannels.size()]);
  }
  expectValuesAsShown(messages, channels);
}

TEST(TsharkJudge, showsTheValuesThatAreMadeOfMessagesOfRealModems) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  std::vector<JudgedType> messages;
  std::vector<Channel> channels;
  for (auto& [channel, pdu] : capturedLteMessages()) {
    messages.push_back(judged(channel, pdu));
    channels.push_back(channel);
  }
  if (messages.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no logs";
  expectValuesAsShown(messages, channels);
}

// A message by its place among the alternatives, and nothing but zeros in it.
Bytes messageAt(std::initializer_list<std::pair<std::size_t, std::size_t>> placesOfCounts) {
  constexpr std::size_t kContent = 60;
  BitWriter bits;
  for (const auto& [place, count] : placesOfCounts) {
    bits.number(static_cast<std::int64_t>(place), 0, static_cast<std::int64_t>(count) - 1);
  }
  Bytes pdu = bits.bytes();
  pdu.resize(pdu.size() + kContent);
  return pdu;
}

TEST(TsharkJudge, namesEveryMessageAlike) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  struct Alternatives {
    Channel channel;
    std::size_t first;   // of the first CHOICE
    std::size_t second;  // of the one that was added
  };
  constexpr std::array kAlternatives = {
      Alternatives{Channel::bcchDlSch, 2, 0}, Alternatives{Channel::mcch, 1, 1},
      Alternatives{Channel::pcch, 1, 0},      Alternatives{Channel::dlCcch, 4, 4},
      Alternatives{Channel::dlDcch, 16, 0},   Alternatives{Channel::ulCcch, 2, 1},
      Alternatives{Channel::ulDcch, 16, 16},
  };
  std::vector<JudgedType> messages;
  for (const auto& [channel, first, second] : kAlternatives) {
    for (std::size_t i = 0; i < first; ++i) {
      messages.push_back(judged(channel, messageAt({{0, 2}, {i, first}})));
    }
    for (std::size_t i = 0; i < second; ++i) {
      messages.push_back(judged(channel, messageAt({{1, 2}, {0, 2}, {i, second}})));
    }
  }
  for (std::size_t i = 0; i < 4; ++i) {  // added to what was added to UL-CCCH
    messages.push_back(judged(Channel::ulCcch, messageAt({{1, 2}, {1, 2}, {0, 2}, {i, 4}})));
  }
  expectAgreement(messages, false);
}

TEST(TsharkJudge, readsMessagesOfRealModemsAlike) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  std::vector<JudgedType> messages;
  for (auto& [channel, pdu] : capturedLteMessages()) messages.push_back(judged(channel, pdu));
  if (messages.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no logs";
  expectAgreement(messages, true);
}

}  // namespace
}  // namespace qel::testing
