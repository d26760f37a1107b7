// Bodies of a modem's logs about UMTS.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "support/diagnostics/SpeakingModem.h"

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

using UmtsModem = SpeakingModem;

}  // namespace qel::diagnostics::test
