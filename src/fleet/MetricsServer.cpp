#include "fleet/MetricsServer.h"

#include <civetweb.h>
#include <prometheus/metric_family.h>

#include <array>
#include <string_view>
#include <utility>

#include "fleet/OpenMetrics.h"

namespace qel::fleet {
namespace {

constexpr int kOk = 200;
constexpr int kForbidden = 403;
constexpr int kNotFound = 404;
constexpr int kNotAllowed = 405;

struct Answer {
  int code = kOk;
  std::string_view words = "OK";
  std::string_view type = "text/plain; charset=utf-8";
  std::string body;
};

Answer refusal(int code, std::string_view words) {
  return {code, words, "text/plain; charset=utf-8", std::string(words) + "\n"};
}

// A page of somebody's in a browser on this machine may have a name of its own that leads here; it
// must not read what is here. Its browser tells the name.
bool isLocalName(std::string_view host) {
  if (host.empty() || host == "localhost" || host.starts_with("localhost:")) return true;
  return listenAddress(host) || listenAddress(std::string(host) + ":0");
}

int say(mg_connection* connection, const Answer& answer, bool hasBody) {
  std::string text = "HTTP/1.1 " + std::to_string(answer.code) + " ";
  text.append(answer.words).append("\r\nContent-Type: ").append(answer.type);
  text.append("\r\nContent-Length: ").append(std::to_string(answer.body.size()));
  if (answer.code == kNotAllowed) text += "\r\nAllow: GET, HEAD";
  text += "\r\nCache-Control: no-store\r\nX-Content-Type-Options: nosniff";
  text += "\r\nConnection: close\r\n\r\n";
  if (hasBody) text += answer.body;
  mg_write(connection, text.data(), text.size());
  return answer.code;
}

std::string_view headerOf(const mg_connection* connection, const char* name) {
  const char* value = mg_get_header(connection, name);
  return value ? value : "";
}

}  // namespace

struct MetricsServer::State {
  ListenAddress address;
  Collect collect;
  mg_context* context = nullptr;

  static int answer(mg_connection* connection) {
    const mg_request_info& asked = *mg_get_request_info(connection);
    const std::string_view method = asked.request_method;
    return say(connection,
               static_cast<const State*>(asked.user_data)->answerTo(connection, asked, method),
               method != "HEAD");
  }

  Answer answerTo(const mg_connection* connection, const mg_request_info& asked,
                  std::string_view method) const {
    if (address.isLoopback && !isLocalName(headerOf(connection, "Host"))) {
      return refusal(kForbidden, "Forbidden");
    }
    if (std::string_view(asked.local_uri ? asked.local_uri : "") != "/metrics") {
      return refusal(kNotFound, "Not Found");
    }
    if (method != "GET" && method != "HEAD") return refusal(kNotAllowed, "Method Not Allowed");
    const NumberText form = acceptedText(headerOf(connection, "Accept"));
    return {kOk, "OK", contentType(form), numberText(collect(), form)};
  }

  // The library would write on standard error.
  static int keepQuiet(const mg_connection* /*connection*/, const char* /*message*/) { return 1; }
};

MetricsServer::MetricsServer(std::unique_ptr<State> state) : _state(std::move(state)) {}

MetricsServer::~MetricsServer() {
  if (_state->context) mg_stop(_state->context);
}

const ListenAddress& MetricsServer::address() const { return _state->address; }

std::unique_ptr<MetricsServer> MetricsServer::open(const ListenAddress& address, Collect collect,
                                                   std::string& error) {
  const std::string why = whyNotFree(address);
  if (!why.empty()) {
    error = address.text() + ": " + why;
    return nullptr;
  }
  std::unique_ptr<MetricsServer> server(
      new MetricsServer(std::make_unique<State>(State{address, std::move(collect)})));
  State& state = *server->_state;
  const std::string place = address.text();
  std::array options = {"listening_ports",
                        place.c_str(),
                        "num_threads",
                        "8",
                        "max_request_size",
                        "8192",
                        "request_timeout_ms",
                        "2000",
                        "enable_keep_alive",
                        "no",
                        "linger_timeout_ms",
                        "1000",
                        static_cast<const char*>(nullptr)};
  mg_callbacks callbacks{};
  callbacks.begin_request = &State::answer;
  callbacks.log_message = &State::keepQuiet;
  state.context = mg_start(&callbacks, &state, options.data());
  if (!state.context) {
    error = address.text() + ": nobody can listen there";
    return nullptr;
  }
  mg_server_port port{};
  if (mg_get_server_ports(state.context, 1, &port) == 1) {
    state.address.port = static_cast<std::uint16_t>(port.port);
  }
  return server;
}

}  // namespace qel::fleet
