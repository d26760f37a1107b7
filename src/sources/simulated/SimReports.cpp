// The files of the simulated SIM card.
#include <array>

#include "messages/runtime/MessageReader.h"
#include "messages/sim.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/Identities.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

void put(Bytes& out, std::uint64_t value, int bytes) {
  for (int i = bytes - 1; i >= 0; --i) out.push_back(static_cast<std::uint8_t>(value >> (8 * i)));
}

void put(Bytes& out, const Bytes& bytes) { out.insert(out.end(), bytes.begin(), bytes.end()); }

Bytes homePlmn() { return encodedPlmn(kMcc, kMnc, kMncDigits); }

Bytes iccid(const PhoneView&) { return swappedDigits(kIccid); }
Bytes imsi(const PhoneView&) { return encodedImsi(kImsi); }

// Normal operation; the network code has two digits (31.102, clause 4.2.18).
Bytes administrativeData(const PhoneView&) { return {0x00, 0x00, 0x00, kMncDigits}; }

// A display condition and 16 characters, filled up (31.102, clause 4.2.12).
Bytes providerName(const PhoneView&) {
  constexpr std::size_t kNameBytes = 16;
  Bytes out(1 + kNameBytes, 0xFF);
  out[0] = 0x01;
  std::ranges::copy(kProviderName, out.begin() + 1);
  return out;
}

// One class of 0 to 9, the last digit of the IMSI (31.102, clause 4.2.15; 22.011, clause 4.2).
Bytes accessClass(const PhoneView&) {
  Bytes out;
  put(out, 1U << (kImsi.back() - '0'), 2);
  return out;
}

// TMSI, location area, a byte of no meaning, updated (31.102, clause 4.2.17).
Bytes locationInformation(const PhoneView& view) {
  Bytes out;
  put(out, view.phone.registration().tmsi(), 4);
  put(out, homePlmn());
  put(out, view.phone.registration().locationArea(), 2);
  put(out, 0xFF00, 2);
  return out;
}

// P-TMSI, its signature, routing area, updated (31.102, clause 4.2.23).
Bytes packetLocationInformation(const PhoneView& view) {
  Bytes out;
  put(out, view.phone.registration().pTmsi(), 4);
  put(out, 0xFFFFFF, 3);
  put(out, homePlmn());
  put(out, view.phone.registration().locationArea(), 2);
  put(out, view.phone.registration().routingArea(), 1);
  put(out, 0x00, 1);
  return out;
}

// GUTI as a mobile identity, last tracking area, updated (31.102, clause 4.2.91).
Bytes epsLocationInformation(const PhoneView& view) {
  constexpr std::uint64_t kGutiLengthAndType = 0x0BF6;
  Bytes out;
  put(out, kGutiLengthAndType, 2);
  put(out, homePlmn());
  put(out, kMmeGroup, 2);
  put(out, kMmeCode, 1);
  put(out, view.phone.registration().mTmsi(), 4);
  put(out, homePlmn());
  const auto& areas = view.phone.registration().trackingAreas();
  put(out, areas.empty() ? 0xFFFE : areas.front(), 2);
  put(out, 0x00, 1);
  return out;
}

// No network is forbidden (31.102, clause 4.2.16).
Bytes forbiddenNetworks(const PhoneView&) { return Bytes(12, 0xFF); }

// Every half hour (31.102, clause 4.2.6).
Bytes searchPeriod(const PhoneView&) { return {0x05}; }

Bytes languages(const PhoneView&) { return {'e', 'n', 'd', 'e'}; }

struct File {
  std::uint32_t identifier;
  Bytes (*content)(const PhoneView&);
};

constexpr std::array kFiles = {
    File{0x2FE2, iccid},
    File{0x6F05, languages},
    File{0x6F07, imsi},
    File{0x6F31, searchPeriod},
    File{0x6F46, providerName},
    File{0x6F73, packetLocationInformation},
    File{0x6F78, accessClass},
    File{0x6F7B, forbiddenNetworks},
    File{0x6F7E, locationInformation},
    File{0x6FAD, administrativeData},
    File{0x6FE3, epsLocationInformation},
};

}  // namespace

std::optional<Bytes> simFiles(const PhoneView& view, std::uint64_t timeMs) {
  KCellularSimCardFiles message;
  message.setTimestamp(timeMs);
  for (const File& row : kFiles) {
    auto file = makeMessage<ElementaryFile>();
    file->setEfId(row.identifier);
    file->setContent(row.content(view));
    message.addEfList(file);
  }
  return message.data();
}

}  // namespace qel::sources
