#include "sources/simulated/Journey.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace qel::sources {
namespace {

// Stretches of road with the speed driven there.
struct Stretch {
  double untilM;
  double metresPerSecond;
};

constexpr std::array kStretches = {
    Stretch{3000, 13.9},
    Stretch{7400, 22.0},
    Stretch{kRoadM, 13.9},
};

constexpr std::array kRidgesM = {3000.0, 5500.0, 7400.0};
constexpr double kRidgeLossDb = 30;
constexpr double kRidgeSlopeM = 200;  // from the crest to the full loss

constexpr double kUnderpassM = 1950;
constexpr double kUnderpassHalfM = 25;
constexpr double kUnderpassLossDb = 65;
constexpr double kNearUnderpassM = 90;

constexpr double kTurnSeconds = 12;

double secondsOneWay() {
  double seconds = 0;
  double fromM = 0;
  for (const Stretch& stretch : kStretches) {
    seconds += (stretch.untilM - fromM) / stretch.metresPerSecond;
    fromM = stretch.untilM;
  }
  return seconds;
}

double positionAfter(double seconds) {
  double fromM = 0;
  for (const Stretch& stretch : kStretches) {
    const double needed = (stretch.untilM - fromM) / stretch.metresPerSecond;
    if (seconds < needed) return fromM + seconds * stretch.metresPerSecond;
    seconds -= needed;
    fromM = stretch.untilM;
  }
  return kRoadM;
}

}  // namespace

double carPositionM(std::uint64_t elapsedMs) {
  const double oneWay = secondsOneWay();
  const double leg = oneWay + kTurnSeconds;
  double seconds = std::fmod(static_cast<double>(elapsedMs) / 1000, 2 * leg);
  if (seconds < leg) return positionAfter(seconds);
  // The way back takes each stretch at the same speed.
  seconds -= leg;
  return positionAfter(std::max(0.0, oneWay - seconds));
}

double ridgeLossDb(double carM, double mastM) {
  double loss = 0;
  for (const double ridgeM : kRidgesM) {
    const bool between = (carM < ridgeM) != (mastM < ridgeM);
    if (between) loss += kRidgeLossDb * std::min(1.0, std::abs(carM - ridgeM) / kRidgeSlopeM);
  }
  return loss;
}

double underpassLossDb(double carM) {
  return std::abs(carM - kUnderpassM) < kUnderpassHalfM ? kUnderpassLossDb : 0;
}

bool nearUnderpass(double carM) { return std::abs(carM - kUnderpassM) < kNearUnderpassM; }

}  // namespace qel::sources
