#include "support/diagnostics/SpeakingModem.h"

#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"

namespace qel::diagnostics::test {

std::vector<std::uint32_t> SpeakingModem::send(std::uint16_t code, ByteView body) {
  const Told& told = _reader.take(LogPacket{code, _timeMs, 0, body});
  return {told.begin(), told.end()};
}

std::vector<std::uint32_t> SpeakingModem::sendEvent(std::uint16_t id, ByteView payload) {
  const Told& told = _reader.take(ModemEvent{id, _timeMs, 0, payload});
  return {told.begin(), told.end()};
}

std::string SpeakingModem::said(std::uint32_t metric) const {
  const auto payload = _reader.report(metric, _timeMs);
  if (!payload) return {};
  auto dictionary = findMetricMessage(metric)->describe(*payload);
  if (!dictionary) return "cannot be read";
  dictionary->remove("timestamp");
  return jsonText(*dictionary);
}

}  // namespace qel::diagnostics::test
