#include "Mixes.h"

#include <cstdlib>
#include <iostream>
#include <string_view>

#include "PhoneMix.h"
#include "UsualMix.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "recording/RecordingReader.h"

namespace qel::bench {
namespace {

constexpr std::size_t kDrawn = 2000;
constexpr std::size_t kMostRecorded = 100'000;
constexpr std::size_t kLongestRecorded = 4096;
constexpr std::uint32_t kSimFiles = 19;

[[noreturn]] void refuse(const std::string& reason) {
  std::cerr << reason << '\n';
  std::exit(EXIT_FAILURE);
}

// All are measured on the same: what is written in the usual way and is not too much for the
// buffers of a rival, as the files of a SIM are.
bool isComparable(std::uint32_t metric, const Bytes& bytes) {
  const MetricMessage* row = findMetricMessage(metric);
  if (!row || metric == kSimFiles || bytes.empty() || bytes.size() > kLongestRecorded) return false;
  const auto message = row->decode(bytes);
  return message && message->data() == bytes;
}

void addRecorded(const char* file, Mix& mix, std::size_t& leftOut) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(file, RecordingReader::BadLines::fail, fault);
  if (!reader) refuse(fault.message);
  while (auto event = reader->next()) {
    const Value* identifier = event->entries.find(kRecordedMetricKey);
    const Value* payload = event->entries.find(kRecordedPayloadKey);
    const auto metric = identifier ? identifier->asInt64() : std::nullopt;
    const Bytes* bytes = payload ? payload->asBytes() : nullptr;
    if (!metric || !bytes) continue;
    const auto number = static_cast<std::uint32_t>(*metric - kMetricEventBase);
    if (mix.payloads.size() < kMostRecorded && isComparable(number, *bytes)) {
      mix.payloads.push_back({number, *bytes});
    } else {
      ++leftOut;
    }
  }
  if (reader->fault()) refuse(reader->fault()->message);
}

// Empty when no recording is named.
Mix recordedMix(std::vector<char*>& arguments) {
  Mix mix{"recorded", {}};
  std::size_t leftOut = 0;
  for (std::size_t i = 1; i < arguments.size();) {
    if (std::string_view(arguments[i]) != "--recording") {
      ++i;
      continue;
    }
    if (i + 1 == arguments.size()) refuse("--recording needs a file");
    addRecorded(arguments[i + 1], mix, leftOut);
    const auto option = arguments.begin() + static_cast<std::ptrdiff_t>(i);
    arguments.erase(option, option + 2);
    if (mix.payloads.empty()) refuse("the recording holds no payload to measure");
  }
  if (leftOut > 0) std::cerr << "recorded: " << leftOut << " payloads are left out\n";
  return mix;
}

}  // namespace

std::vector<Mix> takeMixes(std::vector<char*>& arguments) {
  std::vector<Mix> mixes = {{"busy", phoneMix(kDrawn)}, {"usual", usualMix(kDrawn)}};
  Mix recorded = recordedMix(arguments);
  if (!recorded.payloads.empty()) mixes.push_back(std::move(recorded));
  return mixes;
}

}  // namespace qel::bench
