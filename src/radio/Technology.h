// The radio technologies that the reports speak of.
#pragma once

#include <cstdint>
#include <string_view>

namespace qel {

enum class Technology : std::uint8_t { lte, umts, gsm };

// As in the menu.
constexpr std::string_view nameOf(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return "LTE";
    case Technology::umts:
      return "UMTS";
    case Technology::gsm:
      return "GSM";
  }
  return "";
}

}  // namespace qel
