// What every field of every message means, made from the schemas.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

namespace qel {

// What a number or bytes stand for.
enum class FieldForm : std::uint8_t {
  plain,
  time,           // milliseconds since 1970-01-01 00:00 UTC
  duration,       // its unit is one of time
  yesNo,          // not 0: yes
  accessClasses,  // one bit an access class
  earfcn,         // of a downlink
  uplinkEarfcn,
  uarfcn,  // of a downlink
  arfcn,
  lteBand,       // number of the operating band
  lteBandwidth,  // a code
  rsrpIndex,     // dBm + 140
  rsrqIndex,     // half dB over -19.5
  rscpIndex,     // dBm + 116
  ecnoIndex,     // half dB over -24.5
  rxlevIndex,    // dBm + 110
  mcc,
  mnc,
  mncDigits,
  plmn,            // three bytes
  area,            // a code that is usually read in hexadecimal
  eci,             // eNodeB and sector
  utranCell,       // controller and cell
  bsic,            // two colours
  mobileIdentity,  // digits behind a type
  temporaryIdentity,
  address,         // IPv4 or IPv6
  fileIdentifier,  // of an elementary file
  fileContent,     // of the file whose identifier stands beside it
  tenthsOfHour,
};

// The scale by which a reader judges a quantity, in its unit.
struct QualityScale {
  std::string_view name;  // "RSRP"
  std::string_view unit;
  float lowest;  // ends of an axis that shows every usual value
  float highest;
  float good;  // from here up it is good,
  float fair;  // from here up fair, and else poor
};

struct ValueMeaning {
  std::int32_t value;
  std::string_view name;
  std::string_view meaning;  // may be empty
};

struct FieldFacts {
  std::uint32_t number;
  std::string_view key;        // in the dictionary form
  std::string_view label;      // for a reader
  std::string_view unit;       // in which the tables show it; empty: none
  std::string_view raw;        // how it travels, where the tables show something else
  std::string_view range;      // as text, with the unit; empty: not known
  std::string_view meaning;    // a sentence or two
  std::string_view clause;     // "36.211, clause 6.11" of 3GPP's TS of that number; may be empty
  std::optional<float> least;  // of the range, as shown
  std::optional<float> most;
  FieldForm form;
  const QualityScale* quality;  // null: none
  bool repeated;
  bool identifies;                       // tells the entries of a list apart, from report to report
  std::string_view holds;                // class of the message that it holds; empty: none
  std::span<const ValueMeaning> values;  // of an enumeration
};

struct MessageFacts {
  std::string_view name;  // of the class
  std::string_view meaning;
  std::uint32_t metric;  // whose payload it is, 16 bits; 0: it only stands in others
  std::span<const FieldFacts> fields;

  // By its key, or null.
  const FieldFacts* find(std::string_view key) const;
};

// All 54, by name.
std::span<const MessageFacts> messageFacts();
std::span<const QualityScale* const> qualityScales();

// By the name of the class, or null.
const MessageFacts* findMessageFacts(std::string_view name);
// By the metric whose payload it is, or null.
const MessageFacts* findPayloadFacts(std::uint32_t metric);

}  // namespace qel
