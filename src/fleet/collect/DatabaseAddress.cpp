#include "fleet/collect/DatabaseAddress.h"

#include <libpq-fe.h>

#include <array>
#include <memory>
#include <string_view>

namespace qel::fleet {
namespace {

struct FreeOptions {
  void operator()(PQconninfoOption* options) const { PQconninfoFree(options); }
};

struct Default {
  std::string_view keyword;
  std::string_view value;
};

// A server that has gone without a word is noticed, and not waited for.
constexpr std::array kDefaults = {
    Default{"connect_timeout", "10"},     Default{"keepalives_idle", "30"},
    Default{"keepalives_interval", "10"}, Default{"keepalives_count", "3"},
    Default{"tcp_user_timeout", "60000"}, Default{"fallback_application_name", "qelctl collect"},
};

std::string_view defaultOf(std::string_view keyword) {
  for (const Default& each : kDefaults) {
    if (each.keyword == keyword) return each.value;
  }
  return {};
}

std::string assignment(std::string_view keyword, std::string_view value) {
  std::string text = std::string(keyword) + "='";
  for (const char c : value) {
    if (c == '\'' || c == '\\') text += '\\';
    text += c;
  }
  return text + "' ";
}

}  // namespace

std::optional<std::string> databaseAddress(const std::string& given, std::string& why) {
  char* complaint = nullptr;
  const std::unique_ptr<PQconninfoOption, FreeOptions> options(
      PQconninfoParse(given.c_str(), &complaint));
  PQfreemem(complaint);  // it may repeat a password
  if (!options) {
    why = "a database is \"dbname=NAME host=HOST …\" or postgresql://HOST/NAME";
    return std::nullopt;
  }
  std::string address;
  for (const PQconninfoOption* option = options.get(); option->keyword; ++option) {
    const std::string_view keyword = option->keyword;
    const std::string_view value = option->val ? option->val : defaultOf(keyword);
    if (value.empty()) continue;
    if (keyword == "password" || keyword == "sslpassword") {
      why = "a password stands in ~/.pgpass or in a service file, never on the command line";
      return std::nullopt;
    }
    address += assignment(keyword, value);
  }
  return address;
}

bool isDatabaseOpen(const std::string& address) { return PQping(address.c_str()) == PQPING_OK; }

}  // namespace qel::fleet
