// Another reader of UMTS's messages, field by field: tshark. Where it is not installed these tests
// are skipped.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>

#include "rrc/Captures.h"
#include "rrc/Judge.h"
#include "rrc/RandomRrc.h"
#include "rrc/SchemaFiles.h"
#include "rrc/umts/SystemInformation.h"

namespace qel::testing {
namespace {

struct Names {
  const char* message;
  const char* dissector;
};

constexpr std::array kMessages = {
    Names{"UL-CCCH-Message", "rrc.ul.ccch"}, Names{"DL-CCCH-Message", "rrc.dl.ccch"},
    Names{"DL-DCCH-Message", "rrc.dl.dcch"}, Names{"SysInfoType1", "rrc.si.sib1"},
    Names{"SysInfoType3", "rrc.si.sib3"},    Names{"SysInfoType5", "rrc.si.sib5"},
    Names{"SysInfoType11", "rrc.si.sib11"},  Names{"SysInfoType19", "rrc.si.sib19"},
};

JudgedType judged(const Names& names, Bytes pdu) {
  return {umtsTables().message(names.message), {names.dissector, std::move(pdu)}};
}

// It names each bit of some strings, and splits identities.
Peculiarities peculiarities() {
  Peculiarities found;
  found.opaque = {"sib-Data-fixed", "sib-Data-variable"};
  found.reckoned = {"urnti", "urnti-current", "rnc-id", "c-id", "b0", "b1", "b2", "b3"};
  for (int i = 0; i < 16; ++i) found.reckoned.insert("signature" + std::to_string(i));
  for (int i = 0; i < 12; ++i) found.reckoned.insert("subCh" + std::to_string(i));
  return found;
}

void expectAgreement(const std::vector<JudgedType>& messages, bool mayShowMore) {
  constexpr std::size_t kMostShown = 5;
  std::vector<JudgedMessage> plain;
  for (const JudgedType& message : messages) plain.push_back(message.message);
  const auto judgement = judge(umtsTables(), messages, shownByTshark(plain, "rrc", "rrc."),
                               peculiarities(), mayShowMore);
  EXPECT_GE(judgement.fields, messages.size());
  EXPECT_TRUE(judgement.differences.empty())
      << judgement.differences.size() << " differences in " << judgement.fields << " fields of "
      << messages.size() << " messages";
  for (std::size_t i = 0; i < std::min(kMostShown, judgement.differences.size()); ++i) {
    ADD_FAILURE() << judgement.differences[i];
  }
}

// It looks into what the core network says of itself, which has two bytes, and ends where it cannot
// make sense of it.
bool canBeShown(const RandomRrcMessage& message) {
  const std::set<std::string> looked = {"cn-CommonGSM-MAP-NAS-SysInfo", "gsm-MAP"};
  return std::ranges::none_of(message.tokens, [&](const Token& token) {
    return looked.contains(token.name) && !token.hex.empty() && token.hex.size() != 4;
  });
}

class UmtsTsharkJudge : public ::testing::TestWithParam<Names> {};

TEST_P(UmtsTsharkJudge, readsRandomMessagesAlike) {
  if (!hasTshark()) GTEST_SKIP() << "no tshark";
  constexpr std::size_t kCount = 150;
  RandomRrc random(umtsTables(), {.seed = 25331});
  std::vector<JudgedType> messages;
  while (messages.size() < kCount) {
    auto message = random.message(umtsTables().message(GetParam().message));
    if (canBeShown(message)) messages.push_back(judged(GetParam(), std::move(message.pdu)));
  }
  expectAgreement(messages, false);
}

INSTANTIATE_TEST_SUITE_P(EveryMessage, UmtsTsharkJudge, ::testing::ValuesIn(kMessages));

}  // namespace
}  // namespace qel::testing
