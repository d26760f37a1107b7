// Which of the card's files are looked at. Nothing else of a card is ever kept: no keys, no answers
// of its authentication, no numbers, names and messages of its owner.
#pragma once

#include <cstdint>
#include <span>

namespace qel::diagnostics {

inline constexpr std::uint32_t kIccidFile = 0x2FE2;
inline constexpr std::uint32_t kImsiFile = 0x6F07;

std::span<const std::uint32_t> keptFiles();
bool isKept(std::uint32_t identifier);

// By its short identifier, in the root and in the application of UMTS and LTE (ETSI TS 102 221,
// clause 13; 31.102, annex H); 0 for those that are not kept.
std::uint32_t fileOfRoot(std::uint32_t shortIdentifier);
std::uint32_t fileOfUsim(std::uint32_t shortIdentifier);

}  // namespace qel::diagnostics
