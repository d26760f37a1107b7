// The files of a modem's card, as far as what they hold is known.
#include <algorithm>
#include <optional>
#include <string_view>

#include "messages/runtime/MessageReader.h"
#include "messages/sim.h"
#include "sources/modem_manager/ModemReports.h"
#include "sources/simulated/Bcd.h"

namespace qel::sources {
namespace {

constexpr std::uint8_t kFiller = 0xFF;

// Identifiers: 31.102, clause 4.2, but ETSI TS 102 221, 13.2 and 51.011, clause 10.3.27.
constexpr std::uint32_t kIccidFile = 0x2FE2;
constexpr std::uint32_t kImsiFile = 0x6F07;
constexpr std::uint32_t kProviderNameFile = 0x6F46;
constexpr std::uint32_t kAdministrativeFile = 0x6FAD;
constexpr std::uint32_t kEmergencyFile = 0x6FB7;

Bytes filled(Bytes content, std::size_t size) {
  content.resize(size, kFiller);
  return content;
}

Bytes iccid(const SimReading& sim) {
  constexpr std::size_t kBytes = 10;
  return sim.iccid.empty() ? Bytes() : filled(swappedDigits(sim.iccid), kBytes);
}

Bytes imsi(const SimReading& sim) {
  constexpr std::size_t kBytes = 9;
  return sim.imsi.empty() ? Bytes() : filled(encodedImsi(sim.imsi), kBytes);
}

// The characters that have the same number in the card's alphabet (23.038, clause 6.2.1).
bool isPlain(char c) {
  constexpr std::string_view kSigns = " !\"#%&'()*+,-./:;<=>?";
  return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') ||
         kSigns.find(c) != std::string_view::npos;
}

// When to show the name is not known. A name with characters of other alphabets is left out.
Bytes providerName(const SimReading& sim) {
  constexpr std::size_t kMostCharacters = 16;
  const std::string& name = sim.providerName;
  if (name.empty() || name.size() > kMostCharacters || !std::ranges::all_of(name, isPlain)) {
    return {};
  }
  Bytes content = {kFiller};
  content.insert(content.end(), name.begin(), name.end());
  return filled(std::move(content), 1 + kMostCharacters);
}

// Of four bytes only the last is known: how many digits the network's code has.
Bytes administrativeData(const SimReading& sim) {
  constexpr std::size_t kMccDigits = 3;
  if (sim.network.empty()) return {};
  return {kFiller, kFiller, kFiller, static_cast<std::uint8_t>(sim.network.size() - kMccDigits)};
}

Bytes emergencyNumbers(const SimReading& sim) {
  constexpr std::size_t kNumberBytes = 3;
  Bytes content;
  for (const std::string& number : sim.emergencyNumbers) {
    const Bytes digits = filled(swappedDigits(number), kNumberBytes);
    content.insert(content.end(), digits.begin(), digits.end());
  }
  return content;
}

struct FileRow {
  std::uint32_t identifier;
  Bytes (*content)(const SimReading& sim);  // empty: not known
};

constexpr FileRow kFiles[] = {
    {kIccidFile, iccid},
    {kImsiFile, imsi},
    {kProviderNameFile, providerName},
    {kAdministrativeFile, administrativeData},
    {kEmergencyFile, emergencyNumbers},
};

}  // namespace

std::optional<Bytes> modemSimFiles(const ModemPicture& modem, std::uint64_t timeMs) {
  KCellularSimCardFiles message;
  message.setTimestamp(timeMs);
  for (const FileRow& row : kFiles) {
    Bytes content = row.content(modem.sim);
    if (content.empty()) continue;
    auto file = makeMessage<ElementaryFile>();
    file->setEfId(row.identifier);
    file->setContent(std::move(content));
    message.addEfList(file);
  }
  if (message.efLists().empty()) return std::nullopt;
  return message.data();
}

}  // namespace qel::sources
