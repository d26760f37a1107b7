#include "service/bus/Backlogs.h"

#include <algorithm>
#include <utility>

namespace qel::service {
namespace {

// What a waiting packet costs beside its bytes.
constexpr std::size_t kPacketOverhead = 64;

std::size_t costOf(const Bytes& packet) { return packet.size() + kPacketOverhead; }

}  // namespace

void Backlogs::add(Backlog& backlog) { _all.push_back(&backlog); }

void Backlogs::remove(Backlog& backlog) {
  std::erase(_all, &backlog);
  _bytes -= backlog.bytes;
}

void Backlogs::push(Backlog& backlog, Bytes packet) {
  const std::size_t cost = costOf(packet);
  backlog.bytes += cost;
  _bytes += cost;
  backlog.packets.push_back(std::move(packet));
  while (backlog.bytes > kLargest) dropOldest(backlog);
  while (_bytes > kLargestTotal) dropOldest(largest());
}

void Backlogs::pop(Backlog& backlog) {
  const std::size_t cost = costOf(backlog.packets.front());
  backlog.packets.pop_front();
  backlog.bytes -= cost;
  _bytes -= cost;
}

Backlog& Backlogs::largest() { return **std::ranges::max_element(_all, {}, &Backlog::bytes); }

void Backlogs::dropOldest(Backlog& backlog) {
  pop(backlog);
  ++backlog.dropped;
}

}  // namespace qel::service
