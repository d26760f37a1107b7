// Bodies of a modem's logs about UMTS, and a modem that sends them.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/DiagnosticsReader.h"

namespace qel::diagnostics::test {

struct WrittenUmtsCell {
  std::string mcc = "262";
  std::string mnc = "07";
  unsigned areaCode = 0xD92C;
  unsigned cellId = 0x3600803;
  unsigned uarfcn = 10638;
  unsigned scramblingCode = 407;
};
Bytes umtsCell(const WrittenUmtsCell& cell = {});  // 0x4127

struct WrittenUmtsRank {
  unsigned uarfcn = 10638;
  unsigned scramblingCode = 0;
  int rscpDbm = 0;
  double ecnoDb = 0;
};
struct WrittenGsmRank {
  unsigned arfcn = 0;
  unsigned bsic = 0;
  int levelDbm = 0;
};
Bytes umtsRanks(unsigned version, const std::vector<WrittenUmtsRank>& umts,
                const std::vector<WrittenGsmRank>& gsm = {});  // 0x4005

inline constexpr int kUmtsReceiverOff = -512;
inline constexpr int kUmtsNotSending = -1028;
struct WrittenUmtsFrame {
  int first = kUmtsReceiverOff;  // as logged, in tenths of dB
  int second = kUmtsReceiverOff;
  int sent = kUmtsNotSending;
};
Bytes umtsGainControl(const std::vector<WrittenUmtsFrame>& frames);  // 0x4176

// 0x412F: on that channel, with what stands in front of the message there.
Bytes umtsRrc(unsigned channel, ByteView message);
Bytes umtsRrcOf(unsigned channel, unsigned uarfcn, unsigned scramblingCode, ByteView message);

// A modem whose packets a reader takes. Time goes by only when told.
class UmtsModem {
 public:
  // The metrics that it told something about, in order.
  std::vector<std::uint32_t> send(std::uint16_t code, ByteView body);
  void wait(std::uint64_t milliseconds) { _timeMs += milliseconds; }
  void setTime(std::uint64_t milliseconds) { _timeMs = milliseconds; }

  // The metric as JSON without its time; empty when there is nothing to say.
  std::string said(std::uint32_t metric) const;

  const DiagnosticsReader& reader() const { return _reader; }
  // How many packets came to that.
  std::uint64_t understood() const { return _reader.counts().total().understood; }
  std::uint64_t damaged() const { return _reader.counts().total().damaged; }
  std::uint64_t ofUnknownVersion() const { return _reader.counts().total().unknownVersion; }

 private:
  DiagnosticsReader _reader;
  std::uint64_t _timeMs = 1'790'000'000'000;
};

}  // namespace qel::diagnostics::test
