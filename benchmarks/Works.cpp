#include "Works.h"

#include <algorithm>

#include "OurWorks.h"
#include "messages/catalogue/MetricMessages.h"
#include "peers/PeerWorks.h"

namespace qel::bench {
namespace {

const std::vector<Payload>& mix() {
  static const std::vector<Payload> payloads = phoneMix(2000);
  return payloads;
}

// The mix by metric, in the order in which they first occur.
const std::vector<std::vector<Payload>>& mixByMetric() {
  static const auto byMetric = [] {
    std::vector<std::vector<Payload>> metrics;
    for (const Payload& payload : mix()) {
      const auto found = std::ranges::find_if(
          metrics, [&](const auto& payloads) { return payloads.front().metric == payload.metric; });
      (found != metrics.end() ? *found : metrics.emplace_back()).push_back(payload);
    }
    return metrics;
  }();
  return byMetric;
}

void addDecoding(std::vector<Work>& works, const std::string& group,
                 const std::vector<Payload>& payloads) {
  works.push_back({group, "libprotobuf", decodeStock, &payloads});
  works.push_back({group, "protozero, stack", decodeProtozero, &payloads});
  works.push_back({group, "protozero, shared", keepProtozero, &payloads});
  works.push_back({group, "nanopb", decodeNanopb, &payloads});
  works.push_back({group, "ours", decodeOurs, &payloads});
}

}  // namespace

std::vector<Work> works() {
  std::vector<Work> works;
  addDecoding(works, "decode a fresh message", mix());

  const auto add = [&](const char* group, const char* who, auto prepare) {
    works.push_back({group, who, prepare, &mix()});
  };
  add("decode, dictionary, visit every entry", "libprotobuf", entriesStock);
  add("decode, dictionary, visit every entry", "protozero", entriesProtozero);
  add("decode, dictionary, visit every entry", "ours", dictionaryOurs);
  add("encode a kept message", "libprotobuf", encodeStock);
  add("encode a kept message", "protozero", encodeProtozero);
  add("encode a kept message", "nanopb", encodeNanopb);
  add("encode a kept message", "ours", encodeOurs);
  add("text of a dictionary", "fmt", textFmt);
  add("text of a dictionary", "ours", textOurs);
  add("time text, warm", "strftime", timeStrftime);
  add("time text, warm", "ours", timeOurs);
  add("one metric event", "libprotobuf, std::map, streams", eventStock);
  add("one metric event", "ours", eventOurs);
  add("one metric event, and what is kept of it", "ours without history", eventOurs);
  add("one metric event, and what is kept of it", "ours with history", eventWithHistory);

  for (const auto& payloads : mixByMetric()) {
    const auto name = findMetricMessage(payloads.front().metric)->className;
    addDecoding(works, "decode " + std::string(name), payloads);
  }
  return works;
}

}  // namespace qel::bench
