// Compares what the walker reads of messages with what tshark shows of them.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "rrc/Tshark.h"
#include "rrc/generator/Tables.h"

namespace qel::testing {

// What tshark adds of its own or shows as something else, by fields' names.
struct Peculiarities {
  std::set<std::string> opaque;    // it goes into their bytes; what it shows in there is left out
  std::set<std::string> reckoned;  // made from other values, or shown as text: not compared
};

struct Judgement {
  std::size_t fields = 0;
  std::set<rrc::Mark> kinds;  // of fields
  std::size_t further = 0;    // that tshark shows and the schema passes over
  std::vector<std::string> differences;
};

// `type` is the message's name in the schema. Unless `mayShowMore`, tshark may show nothing else.
struct JudgedType {
  rrc::TypeIndex type;
  JudgedMessage message;
};
Judgement judge(const rrc::generator::Tables& tables, const std::vector<JudgedType>& messages,
                const std::vector<std::vector<Shown>>& shown, const Peculiarities& peculiarities,
                bool mayShowMore);

}  // namespace qel::testing
