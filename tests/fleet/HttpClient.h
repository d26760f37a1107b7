// Questions over HTTP to a server on the loopback device.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace qel::testing {

struct HttpAnswer {
  int code = 0;  // 0: there was none
  std::string head;
  std::string body;
};

// Waits until the server ends the connection, half a minute at most.
HttpAnswer http(std::uint16_t port, const std::string& method, const std::string& path,
                const std::vector<std::string>& headers = {"Host: localhost"});
inline HttpAnswer get(std::uint16_t port, const std::string& path,
                      const std::vector<std::string>& headers = {"Host: localhost"}) {
  return http(port, "GET", path, headers);
}

// A connection over which so much is said and nothing is read.
class RudeClient {
 public:
  RudeClient(std::uint16_t port, const std::string& said);
  ~RudeClient();
  RudeClient(const RudeClient&) = delete;
  RudeClient& operator=(const RudeClient&) = delete;

 private:
  int _descriptor;
};

}  // namespace qel::testing
