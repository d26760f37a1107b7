// A stream with everything that can be wrong with one. It lies in the folder of captures that
// QEL_DIAG_CAPTURES names; skipped without it.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "sources/diagnostics/port/FrameReader.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

std::string capture(const std::string& name) {
  const char* folder = std::getenv("QEL_DIAG_CAPTURES");
  if (folder == nullptr) return {};
  std::ifstream file(std::string(folder) + "/" + name, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

struct Expected {
  std::size_t length = 0;
  std::string checkSum;
  std::string first;
  bool optional = false;
};

std::vector<Expected> expectedPackets(const std::string& lines) {
  std::vector<Expected> expected;
  for (std::size_t begin = 0; begin < lines.size();) {
    const std::size_t end = std::min(lines.find('\n', begin), lines.size());
    const auto entry = nlohmann::json::parse(lines.substr(begin, end - begin));
    begin = end + 1;
    if (!entry.contains("n")) continue;
    expected.push_back(
        {entry["length"], entry["crc"], entry["first"], entry.value("optional", false)});
  }
  return expected;
}

std::string upperHex(std::uint16_t number) {
  std::string text = hexText(
      Bytes{static_cast<std::uint8_t>(number >> 8), static_cast<std::uint8_t>(number & 0xFF)});
  std::ranges::transform(text, text.begin(),
                         [](char c) { return static_cast<char>(std::toupper(c)); });
  return text;
}

bool isThatOne(const Bytes& packet, const Expected& expected) {
  return packet.size() == expected.length && upperHex(checkSum(packet)) == expected.checkSum &&
         hexText(ByteView(packet).first(std::min<std::size_t>(packet.size(), 16))) ==
             expected.first;
}

TEST(QuirkStream, GivesEveryPacketThatCanBeHadAndNoOther) {
  const std::string stream = capture("quirk.bin");
  const auto expected = expectedPackets(capture("quirk.expected.jsonl"));
  if (stream.empty() || expected.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no captures";
  std::vector<Bytes> packets;
  FrameReader reader;
  reader.add(Bytes(stream.begin(), stream.end()),
             [&](ByteView packet) { packets.emplace_back(packet.begin(), packet.end()); });
  auto packet = packets.begin();
  for (std::size_t i = 0; i < expected.size(); ++i) {
    const bool there = packet != packets.end() && isThatOne(*packet, expected[i]);
    EXPECT_TRUE(there || expected[i].optional) << "packet " << i + 1;
    if (there) ++packet;
  }
  EXPECT_TRUE(packet == packets.end()) << "surplus packets";
}

}  // namespace
}  // namespace qel::diagnostics
