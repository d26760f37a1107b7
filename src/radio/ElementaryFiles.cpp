#include "radio/ElementaryFiles.h"

#include <algorithm>
#include <array>
#include <optional>

#include "radio/Digits.h"
#include "radio/Networks.h"

namespace qel {
namespace {

constexpr std::size_t kPlmnBytes = 3;
constexpr std::size_t kAreaBytes = 5;

using Parts = std::vector<FilePart>;
using ReadParts = Parts (*)(ByteView content);

std::uint32_t number(ByteView bytes) {
  std::uint32_t value = 0;
  for (const std::uint8_t byte : bytes) value = value << 8 | byte;
  return value;
}

Parts part(const char* label, const std::optional<std::string>& text) {
  if (!text) return {};
  return {{label, *text}};
}

Parts cardNumber(ByteView content) { return part("Number of the card", packedDigits(content)); }

Parts subscriber(ByteView content) { return part("Digits", mobileIdentity(content)); }

// Networks `step` bytes apart; the empty places of a list are left out.
Parts networks(ByteView content, std::size_t step) {
  std::string text;
  for (std::size_t at = 0; at + kPlmnBytes <= content.size(); at += step) {
    const auto network = networkOfBytes(content.subspan(at, kPlmnBytes));
    if (network) text += (text.empty() ? "" : ", ") + network->text();
  }
  return {{"Networks", text.empty() ? "none" : text}};
}

Parts plainNetworks(ByteView content) { return networks(content, kPlmnBytes); }
// Each with the technologies that it is wanted with.
Parts networksWithTechnology(ByteView content) { return networks(content, kPlmnBytes + 2); }

// A network and a code of two bytes.
Parts area(const char* label, ByteView bytes) {
  const auto network = networkOfBytes(bytes.first(kPlmnBytes));
  if (!network) return {};
  const std::string code = std::to_string(number(bytes.subspan(kPlmnBytes, 2)));
  return {{label, network->text() + ", code " + code}};
}

Parts temporaryAndArea(ByteView content, const char* identity, std::size_t areaAt) {
  if (content.size() < areaAt + kAreaBytes) return {};
  Parts parts = {{identity, "0x" + hexText(content.first(4))}};
  for (FilePart& each : area("Location area", content.subspan(areaAt, kAreaBytes))) {
    parts.push_back(std::move(each));
  }
  return parts;
}

Parts location(ByteView content) { return temporaryAndArea(content, "TMSI", 4); }
// A signature of three bytes comes between.
Parts packetLocation(ByteView content) { return temporaryAndArea(content, "P-TMSI", 7); }

// Twelve bytes of a GUTI, the last tracking area, a status.
Parts epsLocation(ByteView content) {
  constexpr std::size_t kGutiBytes = 12;
  constexpr std::size_t kNetworkAt = 2;
  constexpr std::size_t kTemporaryAt = 8;
  if (content.size() < kGutiBytes + kAreaBytes) return {};
  Parts parts;
  if (const auto network = networkOfBytes(content.subspan(kNetworkAt, kPlmnBytes))) {
    parts = {{"Network of the GUTI", network->text()},
             {"M-TMSI", "0x" + hexText(content.subspan(kTemporaryAt, 4))}};
  }
  for (FilePart& each : area("Tracking area", content.subspan(kGutiBytes, kAreaBytes))) {
    parts.push_back(std::move(each));
  }
  return parts;
}

Parts administrative(ByteView content) {
  constexpr std::size_t kDigitsAt = 3;
  if (content.size() <= kDigitsAt) return {};
  return {{"Digits of the network code", std::to_string(content[kDigitsAt] & 0x0F)}};
}

// Behind a display condition. Only names in plain letters are read.
Parts providerName(ByteView content) {
  std::string name;
  for (const std::uint8_t byte : content.subspan(std::min<std::size_t>(1, content.size()))) {
    if (byte == 0xFF) break;
    if (byte < ' ' || byte > 'z') return {};
    name += static_cast<char>(byte);
  }
  if (name.empty()) return {};
  return {{"Name", name}};
}

Parts accessClasses(ByteView content) {
  constexpr std::size_t kBytes = 2;
  if (content.size() != kBytes) return {};
  std::string text;
  for (unsigned bit = 0; bit < 16; ++bit) {
    if ((number(content) >> bit & 1U) != 0) {
      text += (text.empty() ? "" : ", ") + std::to_string(bit);
    }
  }
  return {{"Classes", text.empty() ? "none" : text}};
}

struct File {
  ElementaryFileName name;
  ReadParts parts = nullptr;
};

constexpr std::array kFiles = {
    File{{0x2F00, "EF_DIR", "applications of the card"}},
    File{{0x2F05, "EF_PL", "preferred languages"}},
    File{{0x2FE2, "EF_ICCID", "number of the card"}, cardNumber},
    File{{0x6F05, "EF_LI", "languages"}},
    File{{0x6F07, "EF_IMSI", "subscriber identity"}, subscriber},
    File{{0x6F08, "EF_Keys", "keys of the packet and circuit-switched domains"}},
    File{{0x6F09, "EF_KeysPS", "keys of the packet domain"}},
    File{{0x6F20, "EF_Kc", "ciphering key"}},
    File{{0x6F30, "EF_PLMNsel", "preferred networks"}, plainNetworks},
    File{{0x6F31, "EF_HPPLMN", "period of the search for a better network"}},
    File{{0x6F38, "EF_UST", "services of the card"}},
    File{{0x6F3E, "EF_GID1", "group identifier, level 1"}},
    File{{0x6F3F, "EF_GID2", "group identifier, level 2"}},
    File{{0x6F40, "EF_MSISDN", "own numbers"}},
    File{{0x6F42, "EF_SMSP", "parameters of short messages"}},
    File{{0x6F46, "EF_SPN", "name of the provider"}, providerName},
    File{{0x6F52, "EF_KcGPRS", "ciphering key of the packet domain"}},
    File{{0x6F53, "EF_LOCIGPRS", "location in the packet domain"}, packetLocation},
    File{{0x6F56, "EF_EST", "enabled services"}},
    File{{0x6F5B, "EF_START-HFN", "start values of ciphering"}},
    File{{0x6F5C, "EF_THRESHOLD", "greatest start value"}},
    File{{0x6F60, "EF_PLMNwAcT", "preferred networks of the user"}, networksWithTechnology},
    File{{0x6F61, "EF_OPLMNwAcT", "preferred networks of the operator"}, networksWithTechnology},
    File{{0x6F62, "EF_HPLMNwAcT", "home networks"}, networksWithTechnology},
    File{{0x6F73, "EF_PSLOCI", "location in the packet domain"}, packetLocation},
    File{{0x6F78, "EF_ACC", "access classes"}, accessClasses},
    File{{0x6F7B, "EF_FPLMN", "forbidden networks"}, plainNetworks},
    File{{0x6F7E, "EF_LOCI", "location in the circuit-switched domain"}, location},
    File{{0x6FAD, "EF_AD", "administrative data"}, administrative},
    File{{0x6FAE, "EF_PHASE", "phase of the card"}},
    File{{0x6FB7, "EF_ECC", "emergency numbers"}},
    File{{0x6FC4, "EF_NETPAR", "parameters of networks"}},
    File{{0x6FC5, "EF_PNN", "names of networks"}},
    File{{0x6FC6, "EF_OPL", "areas of the names of networks"}},
    File{{0x6FCD, "EF_SPDI", "networks shown as the provider's"}},
    File{{0x6FD9, "EF_EHPLMN", "equivalent home networks"}, plainNetworks},
    File{{0x6FE3, "EF_EPSLOCI", "location in LTE"}, epsLocation},
    File{{0x6FE4, "EF_EPSNSC", "security context of LTE"}},
};

const File* findFile(std::uint32_t identifier) {
  const auto found =
      std::ranges::find(kFiles, identifier, [](const File& file) { return file.name.identifier; });
  return found == kFiles.end() ? nullptr : &*found;
}

}  // namespace

const ElementaryFileName* findElementaryFile(std::uint32_t identifier) {
  const File* file = findFile(identifier);
  return file ? &file->name : nullptr;
}

std::vector<FilePart> partsOfFile(std::uint32_t identifier, ByteView content) {
  const File* file = findFile(identifier);
  if (!file || !file->parts) return {};
  return file->parts(content);
}

}  // namespace qel
