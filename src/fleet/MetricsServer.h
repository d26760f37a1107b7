// Numbers for a Prometheus that asks over HTTP.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "fleet/ListenAddress.h"

namespace prometheus {
struct MetricFamily;
}

namespace qel::fleet {

// Answers GET and HEAD of /metrics, on eight threads of its own, a question a connection. A client
// that does not ask or does not read has two seconds, and its thread is then free again; who finds
// all eight busy waits. A question has 8 kB at most.
class MetricsServer {
 public:
  // Called on those threads, at each question.
  using Collect = std::function<std::vector<prometheus::MetricFamily>()>;

  // Nothing when nobody can listen there; `error` is then one line.
  static std::unique_ptr<MetricsServer> open(const ListenAddress& address, Collect collect,
                                             std::string& error);
  ~MetricsServer();
  MetricsServer(const MetricsServer&) = delete;
  MetricsServer& operator=(const MetricsServer&) = delete;

  // Where it listens, with the port that it got.
  const ListenAddress& address() const;

 private:
  struct State;
  explicit MetricsServer(std::unique_ptr<State> state);
  const std::unique_ptr<State> _state;
};

}  // namespace qel::fleet
