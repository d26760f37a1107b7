#include "sources/modem_manager/CellReadings.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>

#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

constexpr std::uint32_t kLargestRxlev = 63;     // 45.008, clause 8.1.4
constexpr std::uint32_t kLargestArea = 0xFFFD;  // 0, FFFE and FFFF stand for none
constexpr std::size_t kPlaceFields = 5;

// How the dictionary of a technology's cell is read.
struct CellKeys {
  std::uint32_t cellType;
  Technology technology;
  const char* area;
  const char* channel;
  std::uint32_t largestChannel;
  const char* code;
  bool codeIsText;  // hexadecimal
  std::uint32_t largestCode;
  std::uint32_t largestCellId;  // all ones stand for none
  const char* level;
  std::optional<double> (*validLevel)(std::optional<double>);
  const char* quality;
  std::optional<double> (*validQuality)(std::optional<double>);
};

constexpr std::uint32_t kLargest28Bits = 0x0FFFFFFE;

// GSM's level is an index and read apart.
constexpr std::array kCellKeys = {
    CellKeys{2, Technology::gsm, "lac", "arfcn", 1023, "base-station-id", true, 63, 0xFFFE, nullptr,
             nullptr, nullptr, nullptr},
    CellKeys{3, Technology::umts, "lac", "uarfcn", 16383, "psc", false, 511, kLargest28Bits, "rscp",
             validRscp, "ecio", validEcno},
    CellKeys{5, Technology::lte, "tac", "earfcn", 262143, "physical-ci", true, 503, kLargest28Bits,
             "rsrp", validRsrp, "rsrq", validRsrq},
};

const CellKeys* keysOf(std::optional<std::uint32_t> cellType) {
  const auto row = std::ranges::find_if(
      kCellKeys, [&](const CellKeys& keys) { return cellType == keys.cellType; });
  return row == kCellKeys.end() ? nullptr : &*row;
}

const CellKeys& keysOf(Technology technology) {
  return *std::ranges::find(kCellKeys, technology, &CellKeys::technology);
}

std::optional<std::uint32_t> number(std::string_view text, int base) {
  std::uint32_t value = 0;
  const auto [end, code] = std::from_chars(text.data(), text.data() + text.size(), value, base);
  if (code != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return value;
}

std::optional<std::uint32_t> hexNumber(std::string_view text) {
  if (text.starts_with("0x") || text.starts_with("0X")) text.remove_prefix(2);
  return number(text, 16);
}

// A text in hexadecimal, or else a number.
std::optional<std::uint32_t> identifier(const BusProperties& cell, const char* key) {
  const auto text = busValue<std::string>(cell, key);
  return text ? hexNumber(*text) : busUnsigned(cell, key);
}

std::optional<std::uint32_t> atMost(std::uint32_t most, std::optional<std::uint32_t> value) {
  return value && *value <= most ? value : std::nullopt;
}

// The bandwidth of a carrier of LTE, in Hz or kHz (36.101, clause 5.6).
std::optional<std::uint32_t> bandwidthCodeOf(std::optional<std::uint32_t> bandwidth) {
  constexpr std::array<std::uint32_t, 6> kBandwidthsKhz = {1400, 3000, 5000, 10000, 15000, 20000};
  const auto found = std::ranges::find_if(kBandwidthsKhz, [&](std::uint32_t khz) {
    return bandwidth == khz || bandwidth == khz * 1000;
  });
  if (found == kBandwidthsKhz.end()) return std::nullopt;
  return static_cast<std::uint32_t>(found - kBandwidthsKhz.begin());
}

// Nothing for a cell that is neither of the serving ones nor a neighbour.
std::optional<CellReading> roleOf(const BusProperties& cell) {
  CellReading reading;
  const bool serving = busValue<bool>(cell, "serving").value_or(false);
  const std::uint32_t type = busUnsigned(cell, "serving-cell-type").value_or(0);
  if (serving && (type == mm::kSecondGroupCell || type == mm::kSecondGroupSecondaryCell)) {
    return std::nullopt;
  }
  reading.primary = serving && type == mm::kPrimaryCell;
  reading.secondary = serving && type == mm::kSecondaryCell;
  reading.serving = serving && !reading.secondary;
  return reading;
}

std::optional<std::uint32_t> validArea(std::optional<std::uint32_t> area) {
  return area && *area != 0 ? atMost(kLargestArea, area) : std::nullopt;
}

}  // namespace

std::optional<double> within(std::optional<double> value, double least, double most) {
  return value && *value >= least && *value <= most ? value : std::nullopt;
}

std::optional<double> validRsrp(std::optional<double> dbm) { return within(dbm, -156, -31); }
std::optional<double> validRsrq(std::optional<double> db) { return within(db, -34, 2.5); }
std::optional<double> validRscp(std::optional<double> dbm) { return within(dbm, -121, -24); }
std::optional<double> validEcno(std::optional<double> db) { return within(db, -32, 0); }
std::optional<double> validRssi(std::optional<double> dbm) {
  constexpr double kNoSignal = -125;
  return dbm != kNoSignal ? within(dbm, kNoSignal, -20) : std::nullopt;
}
std::optional<double> validSnr(std::optional<double> db) { return within(db, -30, 50); }

std::optional<CellReading> cellReading(const BusProperties& cell) {
  const CellKeys* keys = keysOf(busUnsigned(cell, "cell-type"));
  if (!keys) return std::nullopt;
  auto reading = roleOf(cell);
  if (!reading) return std::nullopt;
  reading->technology = keys->technology;
  reading->network = networkCode(busValue<std::string>(cell, "operator-id").value_or(""));
  reading->area = validArea(identifier(cell, keys->area));
  reading->cellId = atMost(keys->largestCellId, identifier(cell, "ci"));
  reading->channel = atMost(keys->largestChannel, busUnsigned(cell, keys->channel));
  if (keys->technology == Technology::lte) {
    reading->bandwidthCode = bandwidthCodeOf(busUnsigned(cell, "bandwidth"));
  }
  reading->code = atMost(keys->largestCode, keys->codeIsText ? identifier(cell, keys->code)
                                                             : busUnsigned(cell, keys->code));
  if (keys->level) {
    reading->levelDbm = keys->validLevel(busDouble(cell, keys->level));
    reading->qualityDb = keys->validQuality(busDouble(cell, keys->quality));
  } else if (const auto rxlev = atMost(kLargestRxlev, busUnsigned(cell, "rx-level"))) {
    reading->levelDbm = static_cast<double>(*rxlev) - 110;
  }
  return reading;
}

std::optional<NetworkCode> networkCode(std::string_view digits) {
  constexpr std::size_t kMccDigits = 3;
  if (digits.size() != 5 && digits.size() != 6) return std::nullopt;
  if (!std::ranges::all_of(digits, [](char c) { return c >= '0' && c <= '9'; })) {
    return std::nullopt;
  }
  const auto mcc = number(digits.substr(0, kMccDigits), 10);
  const auto mnc = number(digits.substr(kMccDigits), 10);
  if (!mcc || !mnc || *mcc == 0) return std::nullopt;
  return NetworkCode{*mcc, *mnc, static_cast<std::uint32_t>(digits.size() - kMccDigits)};
}

std::optional<CellReading> placeReading(std::string_view text, Technology technology) {
  std::array<std::string_view, kPlaceFields> fields;
  for (std::string_view& field : fields) {
    field = text.substr(0, text.find(','));
    text.remove_prefix(std::min(text.size(), field.size() + 1));
  }
  if (!text.empty()) return std::nullopt;
  const auto& [mcc, mnc, lac, ci, tac] = fields;
  CellReading reading;
  reading.technology = technology;
  reading.serving = true;
  reading.network = networkCode(std::string(mcc) + std::string(mnc));
  reading.area = validArea(hexNumber(technology == Technology::lte ? tac : lac));
  const auto cellId = hexNumber(ci);
  // Nought is what stands there when there is no cell.
  if (cellId != 0U) reading.cellId = atMost(keysOf(technology).largestCellId, cellId);
  return reading;
}

}  // namespace qel::sources
