// The answer at a glance: which cell, and how good it is.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "history/Cell.h"
#include "history/Series.h"
#include "history/Viewpoint.h"
#include "radio/Technology.h"
#include "ui/pages/Feed.h"
#include "ui/pages/Reading.h"

namespace qel {

// A line of the page. Its place never changes: a line of which nothing is known says so.
struct NowLine {
  std::string id;  // "radio", "operator", "code", "cell", "connection"
  std::string text;
  std::string spoken;
  bool isKnown = false;

  friend bool operator==(const NowLine&, const NowLine&) = default;
};

struct NowPage {
  // One sentence why nothing is known; while it is set there is nothing else on the page.
  std::string reason;
  std::string advice;  // what to do about that; empty: nothing need be done

  // "LTE band 3, 1842.5 MHz"; "Operator 262-01"; "PCI 123, EARFCN 1300"; "Area 4711, eNodeB 4660,
  // sector 1"; "Connected, 2 carriers".
  std::array<NowLine, 5> lines;
  std::string badge;  // "LTE 3", short, beside the level

  Reading level;
  std::optional<Reading> quality;  // of LTE and UMTS
  std::optional<Reading> sinr;     // of LTE alone

  // Two minutes of the level, for a sparkline; from run to run no line is drawn.
  std::vector<Run> runs;
  std::uint64_t runsFromMs = 0;
  std::uint64_t runsToMs = 0;
  float lowest = 0;  // ends of its axis
  float highest = 0;

  std::string spoken;  // the page in a sentence, for a screen reader

  // The same as plain values, for programs.
  std::optional<Cell> cell;
  std::optional<Technology> technology;
  std::string band;  // "3", "VIII", "DCS 1800"; empty: not known
  std::optional<float> levelDbm;
  std::optional<float> qualityDb;
  std::optional<float> sinrDb;
  std::string rrc;  // "idle", "connected", "CELL_DCH"; empty: not known
  std::optional<unsigned> carriers;
  std::optional<std::uint64_t> ageMs;  // of the level

  // When it will read differently though nothing comes; none: never.
  std::optional<std::uint64_t> changesAtMs;
};

NowPage nowPage(const Viewpoint& viewpoint, const Feed& feed);

}  // namespace qel
