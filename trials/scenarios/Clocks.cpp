// The clock of the day jumps, and the phone comes into another time zone.

#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <thread>

#include "harness/Mounts.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr std::int64_t kHour = 3600;
constexpr std::array<std::int64_t, 6> kOffsets = {
    kHour, -2 * kHour, 24 * kHour, -30 * 24 * kHour, 10 * 365 * 24 * kHour, 0};

// Seconds by which the programs' clocks are off.
class ShiftedClock {
 public:
  ShiftedClock() : _file("/tmp/qel-trial-clock-" + std::to_string(::getpid())) { shift(0); }
  ~ShiftedClock() { std::filesystem::remove(_file); }
  ShiftedClock(const ShiftedClock&) = delete;
  ShiftedClock& operator=(const ShiftedClock&) = delete;

  std::vector<std::string> environment() const {
    return {"LD_PRELOAD=" QEL_SHIFTED_CLOCK, "QEL_TRIAL_CLOCK=" + _file};
  }
  // In place: the programs have mapped the file.
  void shift(std::int64_t seconds) const {
    std::fstream file(_file, std::ios::in | std::ios::out | std::ios::binary);
    if (!file) file.open(_file, std::ios::out | std::ios::binary);
    file.write(reinterpret_cast<const char*>(&seconds), sizeof seconds);
  }

 private:
  const std::string _file;
};

void checkEverybody(Stand& stand, const std::string& after) {
  stand.expectValuesBack(after, Clock::now());
  stand.expectAllAlive(after);
  stand.expectConfigurationsKept(after);
}

// What the C library takes for the machine's zone.
constexpr const char* kZoneFile = "/etc/localtime";
struct Zone {
  const char* file;
  const char* name;
};
constexpr std::array kZones = {Zone{"/usr/share/zoneinfo/Asia/Tokyo", " JST"},
                               Zone{"/usr/share/zoneinfo/Africa/Nairobi", " EAT"},
                               Zone{"/usr/share/zoneinfo/Asia/Karachi", " PKT"}};

}  // namespace

void jumpingClock(Trial& trial) {
  const ShiftedClock clock;
  Stand stand(trial, {.viewer = true, .recorder = true, .environment = clock.environment()});
  for (int i = 0; i < trial.times; ++i) {
    const std::int64_t offset = kOffsets.at(static_cast<std::size_t>(i) % kOffsets.size());
    clock.shift(offset);
    ++trial.figures.tried;
    checkEverybody(stand, "after the clock went to " + std::to_string(offset) + " s");
  }
  stand.expectAllToEnd();
}

void movingZone(Trial& trial) {
  ::unsetenv("TZ");
  Stand stand(trial, {.viewer = true});
  std::optional<FileInPlace> zoneFile;
  for (int i = 0; i < trial.times; ++i) {
    const Zone& zone = kZones.at(static_cast<std::size_t>(i) % kZones.size());
    zoneFile.reset();
    zoneFile.emplace(zone.file, kZoneFile);
    ++trial.figures.tried;
    const auto deadline = Clock::now() + trial.stretched(kBackWithin);
    stand.screen().forgetWhatItSaid();
    while (!stand.screen().hasSaid(zone.name)) {
      promise(Clock::now() < deadline, std::string("the screen follows the zone to") + zone.name);
      std::this_thread::sleep_for(10ms);
    }
    checkEverybody(stand, "after the zone changed");
  }
  stand.expectAllToEnd();
}

}  // namespace qel::trials
