// By what name a phone is known to others.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace qel::fleet {

// Why it cannot be one, in a few words; empty: it can. It is a part of a topic, of 64 bytes at
// most, and no number that could be the device's or the subscriber's.
std::string faultOfPhoneName(std::string_view name);

// The name in the folder's file "phone", which is made of random digits the first time. Nothing
// when that cannot be read or written; `error` is then one line.
std::optional<std::string> keptPhoneName(const std::string& folder, std::string& error);

}  // namespace qel::fleet
