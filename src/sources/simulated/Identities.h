// Who the simulated subscriber is: numbers of the ranges kept for tests, nobody's own.
#pragma once

#include <cstdint>
#include <string_view>

namespace qel::sources {

inline constexpr std::string_view kImsi = "001010123456789";
inline constexpr std::string_view kIccid = "89001010123456789015";
inline constexpr std::string_view kProviderName = "Test Network";
inline constexpr std::uint32_t kMmeGroup = 0x8001;
inline constexpr std::uint32_t kMmeCode = 0x1A;

}  // namespace qel::sources
