// How the measurements of LTE's serving cell are laid out.
#include <map>

#include "support/diagnostics/LteLevels.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics::test {
namespace {

// The oldest way, for two antennas.
void writeOld(BodyWriter& body, std::size_t at, const Levels& levels) {
  body.bitsAt(at, 10, 12, levels.rsrp(0)).bitsAt(at + 4, 12, 12, levels.rsrp(1));
  body.bitsAt(at + 8, 12, 12, levels.rsrp());
  body.bitsAt(at + 12, 12, 10, levels.rsrq(0)).bitsAt(at + 16, 0, 10, levels.rsrq(1));
  body.bitsAt(at + 16, 20, 10, levels.rsrq());
  body.bitsAt(at + 20, 10, 11, levels.rssi(0)).bitsAt(at + 20, 21, 11, levels.rssi(1));
  body.bitsAt(at + 24, 0, 11, levels.rssi());
  body.bitsAt(at + 48, 0, 9, levels.snr(0)).bitsAt(at + 48, 9, 9, levels.snr(1));
}

// Of 2017: words in between.
void writeSpaced(BodyWriter& body, std::size_t at, const Levels& levels) {
  body.bitsAt(at + 16, 10, 12, levels.rsrp(0)).bitsAt(at + 20, 12, 12, levels.rsrp(1));
  body.bitsAt(at + 28, 12, 12, levels.rsrp());
  body.bitsAt(at + 32, 12, 10, levels.rsrq(0)).bitsAt(at + 36, 0, 10, levels.rsrq(1));
  body.bitsAt(at + 40, 10, 10, levels.rsrq());
  body.bitsAt(at + 44, 10, 11, levels.rssi(0)).bitsAt(at + 44, 21, 11, levels.rssi(1));
  body.bitsAt(at + 52, 0, 11, levels.rssi());
  body.bitsAt(at + 76, 0, 9, levels.snr(0)).bitsAt(at + 76, 9, 9, levels.snr(1));
}

// For four antennas. `gap` is 4 where a word stands before the fourth one's RSRP, else 0.
void writeFour(BodyWriter& body, std::size_t at, std::size_t gap, const Levels& levels) {
  body.bitsAt(at + 16, 10, 12, levels.rsrp(0)).bitsAt(at + 20, 12, 12, levels.rsrp(1));
  body.bitsAt(at + 24, 12, 12, levels.rsrp(2));
  at += gap;
  body.bitsAt(at + 28, 0, 12, levels.rsrp(3)).bitsAt(at + 28, 12, 12, levels.rsrpLess40());
  body.bitsAt(at + 36, 0, 10, levels.rsrq(0)).bitsAt(at + 36, 20, 10, levels.rsrq(1));
  body.bitsAt(at + 40, 10, 10, levels.rsrq(2)).bitsAt(at + 40, 20, 10, levels.rsrq(3));
  body.bitsAt(at + 44, 0, 10, levels.rsrq());
  body.bitsAt(at + 48, 0, 11, levels.rssi(0)).bitsAt(at + 48, 11, 11, levels.rssi(1));
  body.bitsAt(at + 52, 0, 11, levels.rssi(2)).bitsAt(at + 52, 11, 11, levels.rssi(3));
  body.bitsAt(at + 56, 0, 11, levels.rssi());
}

void writeFourSnr(BodyWriter& body, std::size_t at, const Levels& levels) {
  body.bitsAt(at, 0, 9, levels.snr(0)).bitsAt(at, 9, 9, levels.snr(1));
  body.bitsAt(at + 4, 0, 9, levels.snr(2)).bitsAt(at + 4, 9, 9, levels.snr(3));
}

// Where a version has what. The cell's word with its number comes first of a cell.
struct Shape {
  std::size_t earfcnBits;
  std::size_t countBits;  // at 4; 0: there is one cell
  std::size_t firstCell;
  std::size_t cellBytes;
  unsigned servingBit;  // 0: it has none
  void (*write)(BodyWriter& body, std::size_t at, const Levels& levels);
};

const std::map<unsigned, Shape>& shapes() {
  static const auto old10 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeOld(b, at + 10, l);
  };
  static const auto old12 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeOld(b, at + 12, l);
  };
  static const auto old16 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeOld(b, at + 16, l);
  };
  static const auto four36 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeFour(b, at, 0, l);
    writeFourSnr(b, at + 80, l);
  };
  static const auto four40 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeFour(b, at, 4, l);
    writeFourSnr(b, at + 84, l);
  };
  static const auto four48 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeFour(b, at, 4, l);
    writeFourSnr(b, at + 92, l);
  };
  static const auto four60 = [](BodyWriter& b, std::size_t at, const Levels& l) {
    writeFour(b, at, 4, l);
  };
  static const std::map<unsigned, Shape> kShapes = {
      {4, {16, 0, 2, 74, 0, old10}},           {7, {32, 0, 4, 76, 0, old12}},
      {18, {32, 0, 4, 88, 12, old16}},         {19, {32, 16, 8, 88, 12, old16}},
      {22, {32, 16, 8, 120, 12, writeSpaced}}, {24, {32, 16, 8, 92, 12, old16}},
      {35, {32, 16, 8, 128, 12, four36}},      {36, {32, 16, 8, 128, 12, four36}},
      {40, {32, 16, 8, 132, 12, four40}},      {48, {32, 16, 12, 140, 12, four48}},
      {50, {32, 16, 12, 140, 12, four48}},     {60, {32, 32, 16, 148, 15, four60}},
      {66, {32, 32, 16, 144, 15, four60}},
  };
  return kShapes;
}

}  // namespace

Bytes lteMeasurementCalled(unsigned name, unsigned version, unsigned earfcn,
                           const std::vector<WrittenLteCell>& cells) {
  const Shape& shape = shapes().at(version);
  BodyWriter data = unwritten(shape.firstCell + cells.size() * shape.cellBytes);
  data.bitsAt(0, 0, static_cast<unsigned>(shape.earfcnBits), earfcn);
  if (shape.countBits > 0) {
    data.bitsAt(4, 0, static_cast<unsigned>(shape.countBits), cells.size());
  }
  std::size_t at = shape.firstCell;
  for (const WrittenLteCell& cell : cells) {
    data.bitsAt(at, 0, 9, cell.pci).bitsAt(at, 9, 3, cell.carrier);
    if (shape.servingBit > 0) data.bitsAt(at, shape.servingBit, 1, cell.serves ? 1 : 0);
    shape.write(data, at, Levels(cell.antennas));
    at += shape.cellBytes;
  }
  return ofParts(24, 25, name, data.written());
}

Bytes lteMeasurement(unsigned version, unsigned earfcn, const std::vector<WrittenLteCell>& cells) {
  return lteMeasurementCalled(version, version, earfcn, cells);
}

}  // namespace qel::diagnostics::test
