// Debian's Prometheus, on a loopback port of the test's own.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "support/ChildProcess.h"

namespace qel::testing {

class PrometheusServer {
 public:
  // In that directory, of which DIRECTORY/data may hold what was measured before. It asks the
  // targets, HOST:PORT each, every quarter of a second.
  explicit PrometheusServer(const std::string& directory,
                            const std::vector<std::string>& targets = {});

  // The lines of promtool, `{labels} => value`, sorted; of a fault one line that says so. The time
  // is in seconds since 1970; 0: now.
  std::vector<std::string> ask(const std::string& query, std::int64_t timeS = 0) const;
  std::string address() const { return "127.0.0.1:" + std::to_string(_port); }

 private:
  const std::uint16_t _port;
  std::unique_ptr<ChildProcess> _process;
};

// Puts what is told there, a text of OpenMetrics with a time in each line, where such a server of
// that directory will find it.
void keepForPrometheus(const std::string& openMetrics, const std::string& directory);

}  // namespace qel::testing
