#include "radio/ElementaryFiles.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

std::string readIn(std::uint32_t identifier, const Bytes& content) {
  std::string text;
  for (const FilePart& part : partsOfFile(identifier, content)) {
    text += (text.empty() ? "" : "; ") + part.label + ": " + part.text;
  }
  return text;
}

TEST(ElementaryFiles, haveTheirNames) {
  ASSERT_TRUE(findElementaryFile(0x6F07));
  EXPECT_EQ(findElementaryFile(0x6F07)->name, "EF_IMSI");
  EXPECT_EQ(findElementaryFile(0x2FE2)->content, "number of the card");
  EXPECT_FALSE(findElementaryFile(0x6FFF));
  EXPECT_FALSE(findElementaryFile(0));
}

TEST(ElementaryFiles, ofNumbersAreRead) {
  EXPECT_EQ(readIn(0x2FE2, {0x98, 0x10, 0x00, 0xF0}), "Number of the card: 8901000");
  EXPECT_EQ(readIn(0x6F07, {8, 0x09, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98, 0x00}),
            "Digits: 001012345678900");
}

TEST(ElementaryFiles, ofNetworksAreReadWithoutTheirEmptyPlaces) {
  EXPECT_EQ(readIn(0x6F7B, {0x62, 0xF2, 0x10, 0xFF, 0xFF, 0xFF, 0x13, 0x60, 0x20}),
            "Networks: 262-01, 310-026");
  EXPECT_EQ(readIn(0x6F7B, Bytes(12, 0xFF)), "Networks: none");
  EXPECT_EQ(readIn(0x6F62, {0x00, 0xF1, 0x10, 0x40, 0x00}), "Networks: 001-01");
}

TEST(ElementaryFiles, ofPlacesAreRead) {
  EXPECT_EQ(readIn(0x6F7E, {0xC0, 0, 0, 1, 0x00, 0xF1, 0x10, 0x10, 0x01, 0xFF, 0x00}),
            "TMSI: 0xc0000001; Location area: 001-01, code 4097");
  EXPECT_EQ(readIn(0x6FE3, {0x0B, 0xF6, 0x00, 0xF1, 0x10, 0x80, 0x01, 0x01, 0xC0, 0, 0, 2, 0x00,
                            0xF1, 0x10, 0x10, 0x02, 0x00}),
            "Network of the GUTI: 001-01; M-TMSI: 0xc0000002; Tracking area: 001-01, code 4098");
}

TEST(ElementaryFiles, ofNamesAndClassesAreRead) {
  EXPECT_EQ(readIn(0x6F46, {0x01, 'T', 'e', 's', 't', 0xFF, 0xFF}), "Name: Test");
  EXPECT_EQ(readIn(0x6F78, {0x00, 0x81}), "Classes: 0, 7");
  EXPECT_EQ(readIn(0x6FAD, {0, 0, 0, 2}), "Digits of the network code: 2");
}

// Every file that is known, with every content of up to forty equal bytes.
TEST(ElementaryFiles, ofAnyContentAreReadOrNot) {
  int known = 0;
  for (std::uint32_t identifier = 0; identifier <= 0xFFFF; ++identifier) {
    if (!findElementaryFile(identifier)) continue;
    ++known;
    for (std::size_t size = 0; size < 40; ++size) {
      for (const std::uint8_t byte : Bytes{0x00, 0x21, 0x41, 0xFF}) {
        const Bytes content(size, byte);
        for (const FilePart& part : partsOfFile(identifier, content)) {
          EXPECT_FALSE(part.label.empty() || part.text.empty()) << identifier << ' ' << size;
        }
      }
    }
  }
  EXPECT_GT(known, 30);
  EXPECT_TRUE(partsOfFile(0x6FFF, Bytes(9, 0)).empty());
}

}  // namespace
}  // namespace qel
