#include "fleet/PhoneName.h"

#include <sys/random.h>
#include <unistd.h>

#include <algorithm>
#include <array>

#include "base/Bytes.h"
#include "base/FatalError.h"
#include "base/FileContent.h"
#include "export/PartFile.h"

namespace qel::fleet {
namespace {

constexpr std::size_t kLongestName = 64;
constexpr std::size_t kDigitsOfAnIdentity = 14;  // an IMEI has 14 or 15, an IMSI up to 15

bool isNamePart(char c) {
  return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '.' ||
         c == '-' || c == '_';
}

// Digits in a row, whatever separates them.
std::size_t longestNumber(std::string_view name) {
  std::size_t longest = 0;
  std::size_t digits = 0;
  for (const char c : name) {
    if (c == '.' || c == '-' || c == '_') continue;
    digits = c >= '0' && c <= '9' ? digits + 1 : 0;
    longest = std::max(longest, digits);
  }
  return longest;
}

std::string randomName() {
  std::array<std::uint8_t, 6> random{};
  if (::getrandom(random.data(), random.size(), 0) != static_cast<ssize_t>(random.size())) {
    fatalError("the system gives no random bytes");
  }
  return "phone-" + hexText(random);
}

}  // namespace

std::string faultOfPhoneName(std::string_view name) {
  if (name.empty() || name.size() > kLongestName) {
    return "a phone's name has 1 to " + std::to_string(kLongestName) + " characters";
  }
  if (!std::ranges::all_of(name, isNamePart)) {
    return "a phone's name has letters, digits, '.', '-' and '_' alone";
  }
  if (longestNumber(name) >= kDigitsOfAnIdentity) {
    return "so long a number may be that of a device or of a SIM";
  }
  return {};
}

std::optional<std::string> keptPhoneName(const std::string& folder, std::string& error) {
  const std::string path = folder + "/phone";
  if (::access(path.c_str(), F_OK) == 0) {
    const Bytes content = contentOfFile(path, kLongestName + 1);
    std::string name(content.begin(), content.end());
    if (name.ends_with('\n')) name.pop_back();
    error = faultOfPhoneName(name);
    if (error.empty()) return name;
    error = path + ": " + error;
    return std::nullopt;
  }
  const std::string name = randomName();
  PartFile file(path);
  if (file.create() && file.write(name + '\n') && file.complete() && file.takePlace()) return name;
  error = file.error();
  return std::nullopt;
}

}  // namespace qel::fleet
