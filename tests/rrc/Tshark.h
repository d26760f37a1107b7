// What tshark reads of RRC messages.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"

namespace qel::testing {

struct JudgedMessage {
  std::string dissector;  // tshark's name for the channel, such as lte_rrc.dl_dcch
  Bytes pdu;
};

// One value that tshark shows.
struct Shown {
  std::string name;               // of the field, as 3GPP writes it
  std::string value;              // a number, or bytes in hexadecimal
  std::string label;              // the alternative's or the enumerated value's name
  std::vector<std::string> path;  // what it lies in, the outermost first
};

bool hasTshark();

// All in one run; one list a message. `prefix` is that of the fields' names, such as lte-rrc.
std::vector<std::vector<Shown>> shownByTshark(const std::vector<JudgedMessage>& messages,
                                              const std::string& protocol,
                                              const std::string& prefix);

}  // namespace qel::testing
