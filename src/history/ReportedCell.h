// The cell that a serving-cell report names.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/Value.h"
#include "history/Cell.h"
#include "history/KnownPlace.h"

namespace qel {

// A cell in little room. A number that is not known is kNone.
struct ReportedCell {
  static constexpr std::uint32_t kNone = ~std::uint32_t{0};  // longer than any of them

  Technology technology = Technology::lte;
  std::uint8_t mncDigits = 0;  // that the report says the network code has; 0: it does not
  std::uint32_t channel = kNone;
  std::uint32_t code = kNone;
  std::uint32_t cellId = kNone;
  std::uint32_t area = kNone;
  std::uint32_t mcc = kNone;
  std::uint32_t mnc = kNone;

  bool isSameCellAs(const ReportedCell& other) const {
    return technology == other.technology && channel == other.channel && code == other.code &&
           cellId == other.cellId;
  }
  // What it leaves out of area and network is that of an earlier report of the same cell.
  void fillFrom(const ReportedCell& earlier);
  friend bool operator==(const ReportedCell&, const ReportedCell&) = default;
  Cell asCell() const;
};

// Reads them; keeps nothing but where in records they stand.
class CellReader {
 public:
  CellReader();

  // `record` as the dispatcher stores it. Nothing when the metric is none of the serving cell, or
  // its report names neither channel nor code nor identity.
  std::optional<ReportedCell> read(std::int64_t metric, const Dictionary& record);

 private:
  struct Places {
    std::int64_t metric;
    Technology technology;
    KnownPlace channel;
    KnownPlace code;
    KnownPlace cellId;
    KnownPlace area;
    KnownPlace mcc;
    KnownPlace mnc;
    KnownPlace mncDigits;
  };

  std::vector<Places> _places;
};

// What numbers a cell is told by where it stands: "PCI" and "EARFCN".
struct PlaceWords {
  std::string_view code;
  std::string_view channel;
};
PlaceWords placeWords(Technology technology);

// "LTE PCI 217, EARFCN 38098, cell 17955330": what is known of it.
std::string textOf(const Cell& cell);

}  // namespace qel
