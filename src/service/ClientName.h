// What a client may call itself.
#pragma once

#include <string_view>

namespace qel::service {

// Names are shown to people, logged and kept: they are short UTF-8 text without control characters
// and without characters that turn the direction of writing. Nothing when the name is good, else
// one line that says what is wrong and does not repeat the name.
std::string_view faultOfClientName(std::string_view name);

}  // namespace qel::service
