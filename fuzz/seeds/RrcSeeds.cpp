#include "fuzz/seeds/RrcSeeds.h"

#include "fuzz/support/Seed.h"
#include "rrc/RandomRrc.h"
#include "rrc/SchemaFiles.h"

namespace qel::fuzz {

std::vector<Bytes> rrcSeeds() {
  constexpr const char* kChannels[] = {// by number
                                       "BCCH-BCH-Message", "BCCH-DL-SCH-Message", "MCCH-Message",
                                       "PCCH-Message",     "DL-CCCH-Message",     "DL-DCCH-Message",
                                       "UL-CCCH-Message",  "UL-DCCH-Message"};
  constexpr int kOfEach = 25;
  testing::RandomRrc random(testing::lteTables(), {.seed = 5, .foreign = true});
  std::vector<Bytes> seeds;
  for (std::size_t channel = 0; channel < std::size(kChannels); ++channel) {
    const rrc::TypeIndex type = testing::lteTables().message(kChannels[channel]);
    for (int i = 0; i < kOfEach; ++i) {
      seeds.push_back(Seed().byte(channel).rest(random.message(type).pdu).bytes);
    }
  }
  return seeds;
}

}  // namespace qel::fuzz
