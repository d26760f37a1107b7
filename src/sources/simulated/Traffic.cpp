#include "sources/simulated/Traffic.h"

#include "sources/simulated/Journey.h"

namespace qel::sources {
namespace {

constexpr std::uint64_t kFirstPageMs = 400;
constexpr std::uint64_t kFirstCallMs = 65'000;

}  // namespace

Traffic::Traffic(std::uint64_t seed, std::uint64_t startMs)
    : _random(scramble(seed, 2)), _page{}, _call{} {
  _page = {startMs + kFirstPageMs, startMs + kFirstPageMs + 12'000, false};
  const std::uint64_t callMs = startMs + kFirstCallMs + _random.between(0, 5000);
  _call = {callMs, callMs + _random.between(20'000, 28'000), false};
}

Traffic::Session Traffic::nextPage(std::uint64_t afterMs) {
  const std::uint64_t beginMs = afterMs + _random.between(10'000, 24'000);
  const std::uint64_t endMs = beginMs + _random.between(3000, 10'000);
  return {beginMs, endMs, _random.between(0, 3) == 0};
}

Traffic::Session Traffic::nextCall(std::uint64_t afterMs) {
  const std::uint64_t beginMs = afterMs + _random.between(34'000, 44'000);
  const std::uint64_t endMs = beginMs + _random.between(20'000, 28'000);
  return {beginMs, endMs, _random.between(0, 1) == 0};
}

Demand Traffic::at(std::uint64_t timeMs, double carM) {
  if (timeMs >= _page.endMs) _page = nextPage(_page.endMs);
  if (timeMs >= _call.endMs) _call = nextCall(_call.endMs);
  if (timeMs >= _call.beginMs) return {Purpose::call, _call.fromNetwork};
  if (timeMs >= _page.beginMs) return {Purpose::data, _page.fromNetwork};
  if (nearUnderpass(carM)) return {Purpose::data, false};
  return {};
}

}  // namespace qel::sources
