// What LTE's plain values say of a message, in the words of another reader of it.
#pragma once

#include <string>
#include <vector>

#include "rrc/Tshark.h"
#include "rrc/lte/Messages.h"

namespace qel::testing {

// All values that the other reader shows under these names, in order.
struct Claim {
  std::vector<std::string> names;   // as 3GPP writes them, or their ends
  std::string within;               // a field around them begins with this; empty: anywhere
  std::vector<std::string> values;  // a number, or bits in hexadecimal
  bool meanings = false;            // they stand in the labels of enumerated values: n50 is 50
  std::vector<std::string> unless;  // later fields that say it instead
};

std::vector<Claim> claimsOf(const rrc::LteMessage& message);

// Empty when the claim holds; else what is shown.
std::string contradiction(const Claim& claim, const std::vector<Shown>& shown);

}  // namespace qel::testing
