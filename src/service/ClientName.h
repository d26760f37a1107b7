// What a client may call itself.
#pragma once

#include <string_view>

namespace qel::service {

// Names are kept and shown to everybody: they are short UTF-8 text. Nothing when the name is good,
// else one line that says what is wrong and does not repeat the name. It may hold characters that a
// terminal obeys: whoever shows it escapes them.
std::string_view faultOfClientName(std::string_view name);

}  // namespace qel::service
