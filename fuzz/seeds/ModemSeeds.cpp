#include "fuzz/seeds/ModemSeeds.h"

#include <bit>
#include <functional>
#include <string>

#include "fuzz/support/Seed.h"
#include "fuzz/support/Variants.h"

namespace qel::fuzz {
namespace {

using Kind = VariantKind;

constexpr std::size_t kAnyWord = 0xFF;  // followed by the word itself

struct Property {
  std::string name;
  std::function<void(Seed&)> write;
};
using Properties = std::vector<Property>;

Seed& word(Seed& seed, std::string_view text) { return seed.byte(kAnyWord).text(text); }

Seed& kind(Seed& seed, Kind kind) { return seed.byte(static_cast<std::size_t>(kind)); }

void write(Seed& seed, const Properties& properties) {
  seed.byte(properties.size());
  for (const Property& property : properties) {
    word(seed, property.name);
    property.write(seed);
  }
}

Property number(std::string name, std::uint32_t value) {
  return {std::move(name), [=](Seed& seed) { kind(seed, Kind::u32).number(value); }};
}
Property state(std::string name, std::uint32_t value) {
  return {std::move(name), [=](Seed& seed) { kind(seed, Kind::i32).number(value); }};
}
Property truth(std::string name) {
  return {std::move(name), [](Seed& seed) { kind(seed, Kind::boolean).byte(1); }};
}
Property real(std::string name, double value) {
  return {std::move(name),
          [=](Seed& seed) { kind(seed, Kind::real).number(std::bit_cast<std::uint64_t>(value)); }};
}
Property text(std::string name, std::string value) {
  return {std::move(name), [=](Seed& seed) { word(kind(seed, Kind::text), value); }};
}
Property path(std::string name, std::size_t object) {
  return {std::move(name), [=](Seed& seed) { kind(seed, Kind::path).byte(object); }};
}
Property paths(std::string name, std::size_t object) {
  return {std::move(name), [=](Seed& seed) { kind(seed, Kind::paths).byte(1).byte(object); }};
}
Property nested(std::string name, Properties properties) {
  return {std::move(name), [=](Seed& seed) { write(kind(seed, Kind::dictionary), properties); }};
}

struct Part {
  std::size_t object;
  std::size_t interface;  // by its place in fuzz/targets/Modems.cpp
  Properties properties;
};

Bytes modem(std::uint32_t technology, const char* signal, const Properties& levels,
            const std::vector<Properties>& cells) {
  const std::vector<Part> parts = {
      {0,
       0,
       {state("State", 8), number("AccessTechnologies", technology), path("Sim", 1),
        paths("Bearers", 2)}},
      {0, 1, {number("RegistrationState", 1), text("OperatorCode", "00101")}},
      {0, 2, {nested(signal, levels)}},
      {1, 5, {text("Imsi", "001010123456789"), text("SimIdentifier", "8900100000000000001F")}},
      {2,
       4,
       {truth("Connected"), nested("Properties", {text("apn", "internet")}),
        nested("Ip4Config",
               {number("method", 2), text("address", "10.1.2.3"), text("dns1", "10.0.0.1")})}},
  };
  Seed seed;
  seed.number(std::uint64_t{1500000000000});
  seed.byte(parts.size());
  for (const Part& part : parts) {
    seed.byte(part.object).byte(part.interface);
    write(seed, part.properties);
  }
  word(seed, "001,01,1A2B,1234567,2B1A");
  seed.byte(cells.size() + 1);
  for (const Properties& cell : cells) write(seed, cell);
  return seed.bytes;
}

}  // namespace

std::vector<Bytes> modems() {
  return {
      modem(1U << 14, "Lte", {real("rsrp", -95.5), real("rsrq", -11), real("snr", 7.5)},
            {{number("cell-type", 5), truth("serving"), text("operator-id", "00101"),
              text("tac", "2B1A"), text("ci", "1234567"), text("physical-ci", "1F"),
              number("earfcn", 1300), real("rsrp", -95.5), real("rsrq", -11)},
             {number("cell-type", 5), text("physical-ci", "20"), number("earfcn", 1300)}}),
      modem(1U << 5, "Umts", {real("rscp", -80), real("ecio", -6), real("rssi", -70)},
            {{number("cell-type", 3), truth("serving"), text("lac", "1A2B"), text("ci", "1234567"),
              number("uarfcn", 10700), number("psc", 100), real("rscp", -80), real("ecio", -6)}}),
      modem(1U << 1, "Gsm", {real("rssi", -75)},
            {{number("cell-type", 2), truth("serving"), text("lac", "1A2B"), text("ci", "2B1A"),
              number("arfcn", 60), text("base-station-id", "2B"), number("rx-level", 30)}}),
  };
}

}  // namespace qel::fuzz
