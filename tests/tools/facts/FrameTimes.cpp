#include "tools/facts/FrameTimes.h"

#include <sys/stat.h>

#include <algorithm>
#include <fstream>
#include <iterator>

namespace qel::testing {
namespace {

using Frame = std::vector<unsigned char>;

bool isRight(const Frame& frame) {
  unsigned sum = 0xFFFF;
  for (std::size_t i = 0; i + 2 < frame.size(); ++i) {
    sum ^= frame[i];
    for (int bit = 0; bit < 8; ++bit) sum = (sum & 1U) != 0 ? sum >> 1U ^ 0x8408U : sum >> 1U;
  }
  sum ^= 0xFFFFU;
  return frame.size() > 2 && frame[frame.size() - 2] == (sum & 0xFFU) &&
         frame[frame.size() - 1] == sum >> 8U;
}

// A run of the first byte is taken off down to one.
bool repair(Frame& frame) {
  while (!isRight(frame)) {
    if (frame.size() < 4 || frame[0] != 0x10 || frame[1] != 0x10) return false;
    frame.erase(frame.begin());
  }
  return true;
}

std::uint64_t number(const Frame& frame, std::size_t offset, std::size_t bytes) {
  std::uint64_t value = 0;
  for (std::size_t i = bytes; i-- > 0;) value = value << 8U | frame[offset + i];
  return value;
}

std::uint64_t millisecondsOf(std::uint64_t stamp) {
  const double steps =
      static_cast<double>(stamp >> 16U) + static_cast<double>(stamp & 0xFFFFU) / 49152;
  return 315'964'800'000 + static_cast<std::uint64_t>(steps * 1.25);
}

FrameTime timesOfEvents(const Frame& frame, std::size_t start, std::uint64_t& stamp) {
  FrameTime time;
  const std::size_t end =
      std::min<std::size_t>(start + 3 + number(frame, start + 1, 2), frame.size() - 2);
  for (std::size_t at = start + 3; at + 4 <= end;) {
    const std::uint64_t head = number(frame, at, 2);
    at += 2;
    const bool isShort = (head & 0x8000U) != 0;
    if (at + (isShort ? 2 : 8) > end) break;
    if (isShort) {
      std::uint64_t next = (stamp & ~std::uint64_t{0xFFFF00}) | number(frame, at, 2) << 8U;
      if (next < stamp) next += 0x1000000;
      stamp = next;
    } else {
      stamp = number(frame, at, 8);
    }
    at += isShort ? 2 : 8;
    const std::uint64_t kind = head >> 13U & 3U;
    at += kind < 3 ? kind : at < end ? 1 + frame[at] : 1;
    const std::uint64_t ms = millisecondsOf(stamp);
    if (time.firstMs > time.lastMs) time = {ms, ms};
    time = {std::min(time.firstMs, ms), std::max(time.lastMs, ms)};
  }
  return time;
}

FrameTime timeOf(const Frame& frame, std::uint64_t& stamp) {
  const std::size_t start = frame[0] == 0x98 ? 8 : 0;
  if (frame.size() >= start + 18 && frame[start] == 0x10) {
    const std::uint64_t ms = millisecondsOf(number(frame, start + 8, 8));
    return {ms, ms};
  }
  if (frame.size() >= start + 5 && frame[start] == 0x60) return timesOfEvents(frame, start, stamp);
  return {};
}

void countFromWriting(std::vector<FrameTime>& times, const std::string& path) {
  constexpr std::uint64_t kClockSetMs = 1'262'304'000'000;
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0) return;
  const auto writtenMs = static_cast<std::uint64_t>(status.st_mtim.tv_sec) * 1000 +
                         static_cast<std::uint64_t>(status.st_mtim.tv_nsec) / 1'000'000;
  std::uint64_t first = 0;
  for (FrameTime& time : times) {
    if (time.firstMs > time.lastMs || time.firstMs >= kClockSetMs) continue;
    if (first == 0) first = time.firstMs;
    time = {time.firstMs - first + writtenMs, time.lastMs - first + writtenMs};
  }
}

}  // namespace

std::vector<FrameTime> frameTimes(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  std::vector<FrameTime> times;
  std::uint64_t stamp = 0;
  Frame frame;
  bool isEscaped = false;
  for (auto byte = std::istreambuf_iterator<char>(file); byte != std::istreambuf_iterator<char>();
       ++byte) {
    const auto value = static_cast<unsigned char>(*byte);
    if (value == 0x7E) {
      if (repair(frame)) times.push_back(timeOf(frame, stamp));
      frame.clear();
      isEscaped = false;
    } else if (value == 0x7D) {
      isEscaped = true;
    } else {
      frame.push_back(isEscaped ? value ^ 0x20U : value);
      isEscaped = false;
    }
  }
  countFromWriting(times, path);
  return times;
}

}  // namespace qel::testing
