#include "sources/diagnostics/port/DiagPort.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <termios.h>
#include <unistd.h>

#include <thread>
#include <vector>

#include "sources/diagnostics/port/AndroidPort.h"
#include "support/diagnostics/FakeRouter.h"
#include "support/diagnostics/Packets.h"
#include "support/diagnostics/PseudoModem.h"
#include "support/diagnostics/SourceLog.h"

namespace qel::diagnostics {
namespace {

using Kind = PortTrouble::Kind;
using test::BodyWriter;
using test::comesTrue;
using test::FakeRouter;
using test::framed;
using test::PseudoModem;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr int kNobody = 65534;

struct Reading {
  explicit Reading(const std::string& address) : port(openPort(address, trouble)) {}

  // Waits for what has been sent; the packets so far, or nothing once the port is lost.
  bool receive() {
    pollfd waited{port->descriptor(), POLLIN, 0};
    ::poll(&waited, 1, 100);
    return port->receive(
        [this](ByteView packet) { packets.emplace_back(packet.begin(), packet.end()); });
  }
  bool receiveUntil(std::size_t count) {
    return comesTrue([&] { return !receive() || packets.size() >= count; }) &&
           packets.size() >= count;
  }

  PortTrouble trouble;
  std::unique_ptr<DiagPort> port;
  std::vector<Bytes> packets;
};

Bytes everyByte() {
  BodyWriter body;
  for (unsigned byte = 0; byte < 256; ++byte) body.u8(byte);
  return test::logPacket(0xB0C0, body.written());
}

TEST(TerminalPort, LetsEveryByteThroughBothWays) {
  PseudoModem modem;
  Reading reading(modem.path());
  ASSERT_TRUE(reading.port);
  modem.send(everyByte());
  ASSERT_TRUE(reading.receiveUntil(1));
  EXPECT_THAT(reading.packets, ElementsAre(everyByte()));
  Bytes bits(512);
  for (unsigned i = 0; i < bits.size(); ++i) bits[i] = static_cast<std::uint8_t>(i);
  const Request request = Request::eventMask(bits);
  ASSERT_TRUE(reading.port->send(request));
  EXPECT_TRUE(comesTrue([&] {
    return modem.with([](test::ModemBrain& brain) { return !brain.requests().empty(); });
  }));
  EXPECT_EQ(modem.with([](test::ModemBrain& brain) { return brain.requests().at(0); }),
            Bytes(request.packet().begin(), request.packet().end()));
}

TEST(TerminalPort, IsLostWhenTheModemIsUnplugged) {
  PseudoModem modem;
  Reading reading(modem.path());
  modem.unplug();
  EXPECT_TRUE(comesTrue([&] { return !reading.receive(); }));
}

TEST(TerminalPort, TakesATurnsWorthOfAFlood) {
  PseudoModem modem;
  Reading reading(modem.path());
  const Bytes noise(4096, 0x55);
  modem.stream(1'000'000, [noise] { return noise; });
  ASSERT_TRUE(comesTrue([&] { return reading.receive() && reading.port->counts().bytes > 0; }));
  for (int i = 0; i < 50; ++i) {
    const std::uint64_t before = reading.port->counts().bytes;
    reading.receive();
    EXPECT_LE(reading.port->counts().bytes - before, 16384U);
  }
}

TEST(TerminalPort, IsAbsentWhereNothingIs) {
  EXPECT_EQ(Reading("/dev/there-is-no-such-port").trouble.kind, Kind::absent);
  EXPECT_EQ(Reading("/dev/null/port").trouble.kind, Kind::absent);
}

TEST(TerminalPort, IsNoFile) {
  Reading reading("/etc/passwd");
  EXPECT_FALSE(reading.port);
  EXPECT_EQ(reading.trouble.kind, Kind::failed);
  EXPECT_FALSE(Reading("/tmp").port);
}

// Root may open what another holds: so a thread that is nobody tries, alone in the process.
Kind triedByNobody(const std::string& path) {
  PortTrouble trouble;
  std::thread([&] {
    if (::getuid() == 0) {
      ASSERT_EQ(::syscall(SYS_setresuid, kNobody, kNobody, kNobody), 0);
    }
    EXPECT_FALSE(openPort(path, trouble));
  }).join();
  return trouble.kind;
}

TEST(TerminalPort, SaysThatAnotherHoldsIt) {
  PseudoModem modem;
  ::chmod(modem.path().c_str(), 0666);
  const int other = ::open(modem.path().c_str(), O_RDWR | O_NOCTTY);
  ASSERT_EQ(::ioctl(other, TIOCEXCL), 0);
  EXPECT_EQ(triedByNobody(modem.path()), Kind::held);
  EXPECT_EQ(Reading(modem.path()).trouble.kind, Kind::held);  // of root, too
  ::close(other);
}

TEST(TerminalPort, IsFreeForOthersAfterwards) {
  PseudoModem modem;
  const int other = ::open(modem.path().c_str(), O_RDWR | O_NOCTTY);
  ASSERT_TRUE(Reading(modem.path()).port);
  EXPECT_TRUE(Reading(modem.path()).port);
  ::close(other);
}

TEST(TerminalPort, IsHeldFromOthersWhileItIsOpen) {
  PseudoModem modem;
  ::chmod(modem.path().c_str(), 0666);
  Reading reading(modem.path());
  ASSERT_TRUE(reading.port);
  EXPECT_EQ(triedByNobody(modem.path()), Kind::held);
}

TEST(TerminalPort, SaysThatRightsAreMissing) {
  if (::getuid() != 0) GTEST_SKIP() << "only root can make a device that is not its own";
  PseudoModem modem;
  ::chmod(modem.path().c_str(), 0600);
  EXPECT_EQ(triedByNobody(modem.path()), Kind::denied);
}

TEST(RouterPort, CarriesPacketsAsTheyAre) {
  FakeRouter router;
  Reading reading(router.address());
  ASSERT_TRUE(reading.port);
  EXPECT_TRUE(reading.port->isShared());
  ASSERT_TRUE(reading.port->send(Request::eventsOff()));
  ASSERT_TRUE(reading.receiveUntil(1));
  router.send(everyByte());
  ASSERT_TRUE(reading.receiveUntil(2));
  EXPECT_EQ(reading.packets[1], everyByte());
  EXPECT_EQ(reading.port->counts().frames, 2U);
}

TEST(RouterPort, SeesTheAnswersToOthers) {
  FakeRouter router;
  Reading first(router.address());
  Reading second(router.address());
  ASSERT_TRUE(first.port->send(Request::build()));
  ASSERT_TRUE(first.receiveUntil(1));
  ASSERT_TRUE(second.port->send(Request::eventsOff()));
  EXPECT_TRUE(first.receiveUntil(2));
}

TEST(RouterPort, SkipsAMessageThatIsTooLong) {
  FakeRouter router;
  Reading reading(router.address());
  ASSERT_TRUE(reading.port->send(Request::eventsOff()));
  ASSERT_TRUE(reading.receiveUntil(1));
  router.send(Bytes(70'000));
  router.send(everyByte());
  ASSERT_TRUE(reading.receiveUntil(2));
  EXPECT_EQ(reading.packets[1], everyByte());
  EXPECT_EQ(reading.port->counts().badFrames, 1U);
}

TEST(RouterPort, SkipsAnEmptyMessage) {
  FakeRouter router;
  Reading reading(router.address());
  ASSERT_TRUE(reading.port->send(Request::eventsOff()));
  ASSERT_TRUE(reading.receiveUntil(1));
  router.send(Bytes());
  router.send(everyByte());
  ASSERT_TRUE(reading.receiveUntil(2));
  EXPECT_EQ(reading.packets[1], everyByte());
}

TEST(RouterPort, IsLostWithTheRouter) {
  auto router = std::make_unique<FakeRouter>();
  Reading reading(router->address());
  ASSERT_TRUE(reading.port);
  router.reset();
  EXPECT_TRUE(comesTrue([&] { return !reading.receive(); }));
}

TEST(RouterPort, IsAbsentWithoutARouter) {
  EXPECT_EQ(Reading("@qel-there-is-no-router").trouble.kind, Kind::absent);
  EXPECT_EQ(Reading("@" + std::string(200, 'x')).trouble.kind, Kind::failed);
}

// The device of those kernels is not to be had here: a socket that keeps messages apart stands in.
class AndroidPortTest : public ::testing::TestWithParam<bool> {
 protected:
  AndroidPortTest() {
    int ends[2];
    if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK, 0, ends) != 0) std::abort();
    device = Descriptor(ends[0]);
    port.emplace(Descriptor(ends[1]), isRemote());
  }
  static bool isRemote() { return GetParam(); }

  BodyWriter envelope(std::uint32_t type) const {
    BodyWriter writer;
    writer.u32(type);
    if (isRemote()) writer.u32(0xFFFFFFFF);
    return writer;
  }
  std::vector<Bytes> received(const Bytes& bytes) {
    std::vector<Bytes> packets;
    ::send(device.number(), bytes.data(), bytes.size(), 0);
    EXPECT_TRUE(port->receive(
        [&](ByteView packet) { packets.emplace_back(packet.begin(), packet.end()); }));
    return packets;
  }

  Descriptor device;
  std::optional<AndroidPort> port;
};

TEST_P(AndroidPortTest, TakesFramesOutOfEnvelopes) {
  const Bytes frame = framed(everyByte());
  const ByteView all = frame;
  const Bytes bytes = envelope(0x20)
                          .u32(3)
                          .u32(frame.size())
                          .bytes(frame)
                          .u32(10)
                          .bytes(all.first(10))
                          .u32(frame.size() - 10)
                          .bytes(all.subspan(10));
  EXPECT_THAT(received(bytes), ElementsAre(everyByte(), everyByte()));
}

TEST_P(AndroidPortTest, SkipsOtherEnvelopes) {
  const Bytes frame = framed(everyByte());
  EXPECT_THAT(received(envelope(0x01).u32(1).u32(frame.size()).bytes(frame)), IsEmpty());
}

TEST_P(AndroidPortTest, ReadsNoFurtherThanAnEnvelopeGoes) {
  const Bytes frame = framed(everyByte());
  const Bytes whole = envelope(0x20).u32(0xFFFFFFFF).u32(frame.size()).bytes(frame);
  for (std::size_t length = 1; length < whole.size(); ++length) {
    const Bytes cut(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length));
    EXPECT_THAT(received(cut), IsEmpty()) << length;
  }
  EXPECT_THAT(received(whole), ElementsAre(everyByte()));
}

TEST_P(AndroidPortTest, PutsRequestsIntoEnvelopes) {
  ASSERT_TRUE(port->send(Request::build()));
  Bytes bytes(64);
  const ssize_t count = ::recv(device.number(), bytes.data(), bytes.size(), 0);
  ASSERT_GT(count, 0);
  bytes.resize(static_cast<std::size_t>(count));
  const Bytes expected = envelope(0x20).bytes(framed(Bytes{0x7C}));
  EXPECT_EQ(bytes, expected);
}

INSTANTIATE_TEST_SUITE_P(WithAndWithoutAChipOfItsOwn, AndroidPortTest, ::testing::Bool());

}  // namespace
}  // namespace qel::diagnostics
