#include "sources/diagnostics/sim/KeptFiles.h"

#include <algorithm>
#include <array>

namespace qel::diagnostics {
namespace {

// 31.102, clause 4.2; of those of 51.011 that have the same number, the same content.
constexpr std::array<std::uint32_t, 26> kKept = {
    0x2F05,      // preferred languages
    kIccidFile,  // the card's number
    0x6F05,      // language
    kImsiFile,   // the subscriber's identity
    0x6F31,      // period of the search for the home network
    0x6F38,      // services of the card
    0x6F3E,      // group, level 1
    0x6F3F,      // group, level 2
    0x6F46,      // provider's name
    0x6F53,      // location information of GPRS
    0x6F56,      // enabled services
    0x6F60,      // networks chosen by the owner
    0x6F61,      // networks chosen by the operator
    0x6F62,      // home network and its technologies
    0x6F73,      // location information of the packet domain
    0x6F78,      // access class
    0x6F7B,      // forbidden networks
    0x6F7E,      // location information
    0x6FAD,      // administrative data
    0x6FB7,      // emergency numbers
    0x6FC5,      // networks' names
    0x6FC6,      // whose names they are
    0x6FCD,      // provider's display information
    0x6FD9,      // equivalent home networks
    0x6FDB,      // how the equivalent home network is shown
    0x6FE3,      // location information of LTE
};

struct ShortName {
  std::uint32_t shortIdentifier;
  std::uint32_t identifier;
};
constexpr ShortName kOfRoot[] = {{0x02, kIccidFile}, {0x05, 0x2F05}};
constexpr ShortName kOfUsim[] = {
    {0x01, 0x6FB7}, {0x02, 0x6F05}, {0x03, 0x6FAD}, {0x04, 0x6F38}, {0x05, 0x6F56}, {0x06, 0x6F78},
    {0x07, 0x6F07}, {0x0A, 0x6F60}, {0x0B, 0x6F7E}, {0x0C, 0x6F73}, {0x0D, 0x6F7B}, {0x11, 0x6F61},
    {0x12, 0x6F31}, {0x13, 0x6F62}, {0x19, 0x6FC5}, {0x1A, 0x6FC6}, {0x1D, 0x6FD9}, {0x1E, 0x6FE3},
};

template <std::size_t size>
std::uint32_t find(const ShortName (&names)[size], std::uint32_t shortIdentifier) {
  const auto name = std::ranges::find(names, shortIdentifier, &ShortName::shortIdentifier);
  return name == std::end(names) ? 0 : name->identifier;
}

}  // namespace

std::span<const std::uint32_t> keptFiles() { return kKept; }

bool isKept(std::uint32_t identifier) {
  return std::ranges::find(kKept, identifier) != kKept.end();
}

std::uint32_t fileOfRoot(std::uint32_t shortIdentifier) { return find(kOfRoot, shortIdentifier); }

std::uint32_t fileOfUsim(std::uint32_t shortIdentifier) { return find(kOfUsim, shortIdentifier); }

}  // namespace qel::diagnostics
