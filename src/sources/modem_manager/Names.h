// Names and numbers of ModemManager's bus interface, as far as they are used.
#pragma once

#include <cstdint>

namespace qel::mm {

inline constexpr const char* kService = "org.freedesktop.ModemManager1";
inline constexpr const char* kRoot = "/org/freedesktop/ModemManager1";
inline constexpr const char* kModem = "org.freedesktop.ModemManager1.Modem";
inline constexpr const char* kModem3gpp = "org.freedesktop.ModemManager1.Modem.Modem3gpp";
inline constexpr const char* kSignal = "org.freedesktop.ModemManager1.Modem.Signal";
inline constexpr const char* kLocation = "org.freedesktop.ModemManager1.Modem.Location";
inline constexpr const char* kBearer = "org.freedesktop.ModemManager1.Bearer";
inline constexpr const char* kSim = "org.freedesktop.ModemManager1.Sim";

inline constexpr const char* kObjectManager = "org.freedesktop.DBus.ObjectManager";
inline constexpr const char* kPropertiesInterface = "org.freedesktop.DBus.Properties";

inline constexpr const char* kNoObject = "/";

inline constexpr std::int32_t kStateEnabled = 6;        // of Modem.State; enabled from here on
inline constexpr std::uint32_t kPlaceOfCell = 1U << 0;  // of Location.Enabled and its keys

// Of Modem.AccessTechnologies.
inline constexpr std::uint32_t kAnyTechnology = 0xFFFFFFFFU;
inline constexpr std::uint32_t kAnyGsm = 0x1EU;
inline constexpr std::uint32_t kHsdpa = 1U << 6;
inline constexpr std::uint32_t kHsupa = 1U << 7;
inline constexpr std::uint32_t kHspa = 1U << 8 | 1U << 9;  // and HSPA+
inline constexpr std::uint32_t kAnyUmts = 0x3E0U;
inline constexpr std::uint32_t kAnyLte = 1U << 14 | 1U << 16 | 1U << 17;

enum Registration : std::uint32_t {
  kIdle = 0,
  kHome = 1,
  kSearching = 2,
  kDenied = 3,
  kUnknown = 4,
  kRoaming = 5,
  kHomeSmsOnly = 6,
  kRoamingSmsOnly = 7,
  kEmergencyOnly = 8,
  kHomeNoFallback = 9,
  kRoamingNoFallback = 10,
};

// Of a cell's serving-cell-type.
enum ServingCellType : std::uint32_t {
  kPrimaryCell = 1,
  kSecondaryCell = 2,
  kSecondGroupCell = 3,
  kSecondGroupSecondaryCell = 4,
};

// Bits of a bearer's ip-type.
inline constexpr std::uint32_t kIpv4 = 1U << 0;
inline constexpr std::uint32_t kIpv6 = 1U << 1;
inline constexpr std::uint32_t kIpv4v6 = 1U << 2;

enum PacketService : std::uint32_t { kAttached = 1, kDetached = 2 };

}  // namespace qel::mm
