#include "base/Bytes.h"

#include <gtest/gtest.h>

#include <cctype>
#include <string>

namespace qel {
namespace {

ByteView viewOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

TEST(HexText, isLowerCaseWithTwoDigitsAByte) {
  EXPECT_EQ(hexText(Bytes{0x00, 0x0A, 0xFF}), "000aff");
  EXPECT_EQ(hexText({}), "");
}

TEST(BytesFromHex, refusesEveryOtherCharacter) {
  for (int character = 0; character < 256; ++character) {
    if (std::isxdigit(character) != 0) continue;
    const char c = static_cast<char>(character);
    EXPECT_EQ(bytesFromHex(std::string{'1', '2', c, '3'}), std::nullopt) << character;
    EXPECT_EQ(bytesFromHex(std::string{'1', '2', '3', c}), std::nullopt) << character;
  }
}

TEST(BytesFromHex, readsBothCasesAndNothingElse) {
  EXPECT_EQ(bytesFromHex("00aAfF"), (Bytes{0x00, 0xAA, 0xFF}));
  EXPECT_EQ(bytesFromHex(""), Bytes());
  EXPECT_EQ(bytesFromHex("0"), std::nullopt);
  EXPECT_EQ(bytesFromHex("0g"), std::nullopt);
  EXPECT_EQ(bytesFromHex("0x00"), std::nullopt);
}

// The test vectors of RFC 4648, section 10.
TEST(Base64, agreesWithTheVectorsOfItsDefinition) {
  const std::pair<std::string_view, std::string_view> vectors[] = {
      {"", ""},
      {"f", "Zg=="},
      {"fo", "Zm8="},
      {"foo", "Zm9v"},
      {"foob", "Zm9vYg=="},
      {"fooba", "Zm9vYmE="},
      {"foobar", "Zm9vYmFy"},
  };
  for (const auto& [plain, encoded] : vectors) {
    const ByteView bytes = viewOf(plain);
    EXPECT_EQ(base64Text(bytes), encoded);
    EXPECT_EQ(bytesFromBase64(encoded), Bytes(bytes.begin(), bytes.end()));
  }
}

TEST(Base64, readsWhatItWritesWhateverTheBytes) {
  for (std::size_t size = 0; size < 20; ++size) {
    for (unsigned first = 0; first < 256; first += 5) {
      Bytes bytes;
      for (std::size_t i = 0; i < size; ++i) {
        bytes.push_back(static_cast<std::uint8_t>(first + 83 * i));
      }
      EXPECT_EQ(bytesFromBase64(base64Text(bytes)), bytes);
    }
  }
}

TEST(Base64, refusesEveryOtherCharacterAtEveryPlace) {
  const std::string good = "Zm9vYmFyZg==";
  for (std::size_t place = 0; place < good.size(); ++place) {
    for (int character = 0; character < 256; ++character) {
      const auto c = static_cast<unsigned char>(character);
      if (std::isalnum(c) != 0 || c == '+' || c == '/') continue;
      std::string text = good;
      text[place] = static_cast<char>(c);
      if (text == good) continue;
      EXPECT_EQ(bytesFromBase64(text), std::nullopt) << place << " " << character;
    }
  }
}

TEST(Base64, refusesWhatIsNotCanonical) {
  for (const std::string_view text : {"Z", "Zg", "Zg=", "Zg===", "Z===", "====", "Zh==", "Zm9=",
                                      "Zm9v\n", "Zm 9", "Z-_v", "=m9v"}) {
    EXPECT_EQ(bytesFromBase64(text), std::nullopt) << text;
  }
}

}  // namespace
}  // namespace qel
