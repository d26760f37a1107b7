// Curves of the serving cell and its strongest neighbours, and what happened meanwhile.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/TimeZone.h"
#include "history/Series.h"
#include "history/Viewpoint.h"
#include "ui/pages/Grade.h"
#include "ui/pages/Reading.h"

namespace qel {

// The part of time that is looked at. Its end follows the viewpoint's moment unless it was moved.
struct SignalsRange {
  static constexpr std::uint64_t kShortestMs = 10 * 1000;
  static constexpr std::uint64_t kLongestMs = 24 * 60 * 60 * 1000;

  std::uint64_t spanMs = 10 * 60 * 1000;
  std::uint64_t backMs = 0;  // how far its end lies before the moment
  unsigned columns = 0;      // to draw in: curves have four points a column at most; 0: all points

  // `factor` below 1 looks closer. What stands at that fraction (0 left, 1 right) stays there.
  SignalsRange zoomed(double factor, double around = 1.0) const;
  // To earlier times by a fraction of the span; negative: to later ones, until the end is now.
  SignalsRange moved(double spans) const;

  friend bool operator==(const SignalsRange&, const SignalsRange&) = default;
};

struct AxisLabel {
  float value = 0;
  std::string text;              // "-95"
  Grade grade = Grade::unknown;  // of what lies from here up to the next label
  std::string word;              // that grade, where it begins: "good"; else empty

  friend bool operator==(const AxisLabel&, const AxisLabel&) = default;
};

struct Curve {
  std::string id;     // "serving", or the neighbour's technology, channel and code
  std::string label;  // "PCI 123"; empty: the serving cell, whose code changes along the curve
  bool isServing = false;
  std::vector<Run> runs;  // never draw from one to the next
};

struct Chart {
  std::string id;  // of the quantity: "LTE RSRP"
  std::string title;
  std::string unit;
  Quantity quantity = Quantity::lteRsrp;
  float lowest = 0;  // ends of the axis; every value lies within
  float highest = 0;
  std::vector<AxisLabel> labels;  // at the quality thresholds, lowest first
  std::vector<Curve> curves;      // the serving cell's last, so that it lies on top
  Reading newest;                 // of the serving cell
  std::string spoken;
};

// A thin vertical. `letter`: H handover, R reselection, C the connection (RRC), T technology.
struct SignalMark {
  std::string id;
  std::uint64_t timeMs = 0;
  char letter = 'H';
  std::string text;

  friend bool operator==(const SignalMark&, const SignalMark&) = default;
};

struct TimeLabel {
  std::uint64_t timeMs = 0;
  std::string text;  // "20:21", with seconds where they tell labels apart

  friend bool operator==(const TimeLabel&, const TimeLabel&) = default;
};

// A line of the table below the curves.
struct NeighbourRow {
  std::string id;          // technology, channel and code
  std::string name;        // "PCI 123"
  std::string channel;     // "EARFCN 1300"
  std::string level;       // "-98 dBm"
  std::string quality;     // "-12.5 dB"; empty: not measured
  std::string difference;  // to the serving cell's level: "+6 dB"; empty: other technology
  std::string age;         // empty while fresh
  bool hasCurve = false;   // is among those drawn
  std::string spoken;

  friend bool operator==(const NeighbourRow&, const NeighbourRow&) = default;
};

struct SignalsPage {
  std::string notice;  // one sentence while there is no curve; then `charts` is empty
  std::uint64_t fromMs = 0;
  std::uint64_t toMs = 0;
  std::string span;                      // "10 minutes to 20:21:07"
  std::vector<TimeLabel> times;          // of the axis, oldest first
  std::vector<Chart> charts;             // those of the technology in use first
  std::vector<SignalMark> marks;         // oldest first
  std::vector<NeighbourRow> neighbours;  // strongest first
  std::string neighboursNotice;          // instead of them
  bool canZoomIn = true;
  bool canZoomOut = true;
  bool isAtEnd = true;  // its end follows the moment
};

SignalsPage signalsPage(const Viewpoint& viewpoint, const SignalsRange& range,
                        const TimeZone& zone = systemTimeZone());

// What the curves say at a time.
struct ReadOffValue {
  std::string curve;  // its id
  std::string label;
  std::string text;  // "-98 dBm"
  float value = 0;
  bool isServing = false;

  friend bool operator==(const ReadOffValue&, const ReadOffValue&) = default;
};
struct ReadOff {
  std::uint64_t timeMs = 0;  // of the nearest point of the serving cell, or the one asked for
  std::string time;          // "20:21:07"
  std::vector<ReadOffValue> values;  // serving first, then strongest first; none within a gap
  std::string spoken;
};
ReadOff readOff(const Chart& chart, std::uint64_t timeMs, const TimeZone& zone = systemTimeZone());
// The next point of the serving cell's curve, for reading off with keys; none: there is none.
std::optional<std::uint64_t> pointAfter(const Chart& chart, std::uint64_t timeMs);
std::optional<std::uint64_t> pointBefore(const Chart& chart, std::uint64_t timeMs);

}  // namespace qel
