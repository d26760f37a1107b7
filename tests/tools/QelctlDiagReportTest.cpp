#include "recording/TemporaryFile.h"
#include "support/diagnostics/Packets.h"
#include "support/diagnostics/PseudoModem.h"
#include "support/diagnostics/SourceLog.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

using diagnostics::test::BodyWriter;
using diagnostics::test::framed;
using diagnostics::test::logPacket;
using diagnostics::test::wrapped;

constexpr const char* kImei = "490154203237518";
constexpr const char* kImsi = "001010123456789";

std::string frame(const Bytes& packet) {
  const Bytes bytes = framed(packet);
  return {bytes.begin(), bytes.end()};
}

// A log in which identities stand in every place that a packet has for anything.
std::string tellingLog() {
  const Bytes identities = BodyWriter().u8(99).text(kImei).text(kImsi).u32(0xC0FFEE42);
  return frame(logPacket(0xB0C2, identities)) + frame(logPacket(0xB0EE, identities)) +
         frame(logPacket(0xB0EF, identities)) + frame(logPacket(0x1098, identities)) +
         frame(BodyWriter().u8(0x0C).text(kImei)) + frame(BodyWriter().u8(0x4B).text(kImsi)) +
         frame(BodyWriter().u8(0x7C).u8(2).u16(0).u32(1234).u32(7).text("MPSS.1.0-TEST").u8(0));
}

TEST(QelctlDiagReport, tellsKindsLengthsAndTheChipsSoftware) {
  const TemporaryFile log(".qmdl", tellingLog());
  const Outcome outcome = qelctl({"diag-report", log.path()});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  for (const char* part : {"chip: 1234\n", "build: MPSS.1.0-TEST\n", "frames: 7 good, 0 bad",
                           "B0C2/99: 1 packets, 35 to 35 bytes, 1 of an unknown version",
                           "B0EF: 1 packets, 35 to 35 bytes, 1 not read"}) {
    EXPECT_NE(outcome.out.find(part), std::string::npos) << part << " in " << outcome.out;
  }
}

TEST(QelctlDiagReport, hasNothingOfWhatIsInThePackets) {
  const TemporaryFile log(".qmdl", tellingLog());
  const std::string report = qelctl({"diag-report", log.path()}).out;
  ASSERT_FALSE(report.empty());
  for (const std::string identity : {kImei, kImsi, "c0ffee42", "C0FFEE42", "3237995586"}) {
    for (std::size_t i = 0; i + 6 <= identity.size(); ++i) {
      EXPECT_EQ(report.find(identity.substr(i, 6)), std::string::npos) << identity;
    }
  }
}

TEST(QelctlDiagReport, listensToAModem) {
  diagnostics::test::PseudoModem modem;
  const Bytes packet = framed(logPacket(0xB0C2, Bytes{99}));
  modem.stream(20, [packet] { return packet; });
  const Outcome outcome = qelctl({"diag-report", modem.path(), "--duration", "3"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  for (const char* part : {"model: Pseudo modem\n", "build: MPSS.PSEUDO", "radio 1, B0C2/99: "}) {
    EXPECT_NE(outcome.out.find(part), std::string::npos) << part << " in " << outcome.out;
  }
  EXPECT_TRUE(diagnostics::test::comesTrue(
      [&] { return modem.with([](auto& brain) { return !brain.sendsAnyLog(); }); }));
}

TEST(QelctlDiagReport, leavesOutPacketsOfRadiosThatNoModemHas) {
  const Bytes body = BodyWriter().u8(99);
  const TemporaryFile log(".qmdl", frame(wrapped(16, logPacket(0xB0C2, body))) +
                                       frame(wrapped(17, logPacket(0xB0C3, body))));
  const Outcome outcome = qelctl({"diag-report", log.path()});
  EXPECT_NE(outcome.out.find("radio 16, B0C2"), std::string::npos) << outcome.out;
  EXPECT_EQ(outcome.out.find("B0C3"), std::string::npos) << outcome.out;
}

TEST(QelctlDiagReport, saysWhyThereIsNone) {
  const Outcome missing = qelctl({"diag-report", "/nonexistent.qmdl"});
  EXPECT_EQ(missing.exitCode, 66);
  EXPECT_EQ(missing.err, "qelctl: /nonexistent.qmdl: No such file or directory\n");
  EXPECT_EQ(missing.out, "");
  const Outcome port = qelctl({"diag-report", "/dev/no-such-port"});
  EXPECT_EQ(port.exitCode, 66);
  EXPECT_EQ(port.err, "qelctl: /dev/no-such-port: No such file or directory\n");
  EXPECT_EQ(qelctl({"diag-report", "--duration", "0"}).exitCode, 64);
  const TemporaryFile text(".txt", "This is a letter to nobody.");
  EXPECT_EQ(qelctl({"diag-report", text.path()}).exitCode, 65);
}

}  // namespace
}  // namespace qel::testing
